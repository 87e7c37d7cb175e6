% SPDX-License-Identifier: MIT

function soft = quarzel_quantise (llr, scale)
  %QUARZEL_QUANTISE  Turn log-likelihood ratios or samples into soft values for quarzel_decode.
  %
  %   soft = quarzel_quantise (llr)
  %   soft = quarzel_quantise (llr, scale)
  %
  %   llr holds real numbers, double or single, in an array of any size or in a cell array of such arrays. POSITIVE
  %   MEANS BIT 1: llr = log (P(bit = 1) / P(bit = 0)). Change the sign first where yours is the other way round.
  %   Infinities become the ends of the range.
  %
  %   scale, above 0, is the number of units of 1/8 for a value of 1. The default, also for [], is 4, the best one
  %   for log-likelihood ratios. For samples of +1 and -1 with noise of the variance v it is 8 / v.
  %
  %   soft is int8, of the size of llr: the products, rounded to the nearest whole number (halves to the even one)
  %   and clipped to -128 ... 127.
  %
  %   Example
  %
  %     quarzel_quantise ([-0.6, 0, 2.5, 1000])      % -2  0  10  127
  %
  %   See also quarzel_decode, quarzel_encode.

  if (nargin < 1)
    error ('quarzel:value', 'quarzel_quantise: log-likelihood ratios are needed; call quarzel_quantise (llr)');
  end
  if (nargin < 2)
    scale = [];
  elseif (~(isnumeric (scale) && isreal (scale) && (isscalar (scale) || isempty (scale))))
    error ('quarzel:type', 'quarzel_quantise: scale must be a real number');
  end
  if (iscell (llr))
    soft = cellfun (@(values) quarzel_quantise (values, scale), llr, 'UniformOutput', false);
    return
  end
  if (~(isfloat (llr) && isreal (llr)))
    error ('quarzel:type', 'quarzel_quantise: llr must hold real numbers of class double or single, not %s', ...
           kind (llr));
  end
  [problem, soft] = quarzel_mex ('quantise', full (llr), double (scale));
  if (~isempty (problem))
    error (['quarzel:', problem.fault], 'quarzel_quantise: %s', problem.text);
  end
end

function text = kind (values)
  text = class (values);
  if (isfloat (values))
    text = ['complex ', text];
  end
end

%!assert (quarzel_quantise ([-0.6, 0, 2.5, 1000]), int8 ([-2 0 10 127]))
%!assert (quarzel_quantise ([-0.6, 0, 2.5, 1000], 8), int8 ([-5 0 20 127]))
%!assert (quarzel_quantise (single ([0.375; -Inf; Inf]), int16 (8)), int8 ([3; -128; 127]))
%!assert (quarzel_quantise ([0.125, 0.375, -0.125, -0.375]), int8 ([0 2 0 -2]))
%!assert (quarzel_quantise (sparse ([0 1])), int8 ([0 4]))
%!assert (quarzel_quantise (zeros (3, 0, 2)), zeros (3, 0, 2, 'int8'))
%!assert (quarzel_quantise (reshape (1:24, 2, 3, 4)), int8 (reshape (4 * (1:24), 2, 3, 4)))
%!assert (quarzel_quantise ({1, [2 3]}), {int8(4), int8([8 12])})
%!assert (quarzel_quantise (1, []), int8 (4))
%!assert (quarzel_quantise ({1, [2 3]}, 2), {int8(2), int8([4 6])})

%!test  % what decodes: log-likelihood ratios of samples with noise
%! bits = uint8 (rand (64, 5) > 0.5);
%! [s, p, q] = quarzel_encode (bits);
%! receive = @(code) quarzel_quantise (2 / 0.25 * (2 * double (code) - 1 + 0.5 * randn (size (code))));
%! assert (mean (vec (quarzel_decode (receive (s), receive (p), receive (q)) ~= bits)) < 0.05);

%!error <log-likelihood ratios are needed> quarzel_quantise ()
%!error <1 of 2 values are not a number \(NaN\); 0 says that a bit is unknown> quarzel_quantise ([1, NaN])
%!error id=quarzel:value quarzel_quantise (NaN)
%!error <the scale must be above 0 and finite> quarzel_quantise (1, 0)
%!error <the scale must be above 0 and finite> quarzel_quantise (1, Inf)
%!error <scale must be a real number> quarzel_quantise (1, [1 2])
%!error <scale must be a real number> quarzel_quantise (1, '4')
%!error id=quarzel:type quarzel_quantise (int8 (1))
%!error <double or single, not int8> quarzel_quantise (int8 (1))
%!error <double or single, not complex double> quarzel_quantise (1i)
