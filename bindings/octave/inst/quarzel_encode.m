% SPDX-License-Identifier: MIT

function [sys, par1, par2] = quarzel_encode (bits)
  %QUARZEL_ENCODE  Encode LTE code blocks (3GPP TS 36.212, section 5.1.3.2).
  %
  %   [sys, par1, par2] = quarzel_encode (bits)
  %
  %   bits, logical or numbers of value 0 and 1, is
  %
  %     a vector of K bits         one block; the streams are vectors of K + 4, rows or columns as bits
  %     a matrix                   a block in each column
  %     a cell array of vectors    blocks of any sizes; the streams are cell arrays
  %
  %   K is one of the 188 block sizes of LTE, 40 to 6144. sys, par1 and par2 are int8, of 0 and 1: the systematic
  %   bits and the parities of the two constituent codes, each with its four tail positions. 16 * sys - 8 are the
  %   noiseless soft values of amplitude 1.0 for quarzel_decode.
  %
  %   See also quarzel_decode.

  if (nargin < 1)
    error ('quarzel:value', 'quarzel_encode: bits are needed; call quarzel_encode (bits)');
  end
  if (iscell (bits))
    [sys, par1, par2] = cellfun (@quarzel_encode, bits, 'UniformOutput', false);
    return
  end
  if (~(islogical (bits) || isnumeric (bits)) || ndims (bits) > 2)
    error ('quarzel:type', 'quarzel_encode: bits must be a logical or numeric vector or matrix, not %s', ...
           class (bits));
  end
  if (any (bits(:) ~= 0 & bits(:) ~= 1))
    error ('quarzel:value', 'quarzel_encode: a bit must be 0 or 1; packed bits have to be unpacked first');
  end
  is_row = size (bits, 1) == 1;
  columns = uint8 (full (bits));
  if (is_row)
    columns = columns';
  end
  [problem, code] = quarzel_mex ('encode', columns);
  if (~isempty (problem))
    error (['quarzel:', problem.fault], 'quarzel_encode: %s', problem.text);
  end
  sys = stream (code, 1, is_row);
  par1 = stream (code, 2, is_row);
  par2 = stream (code, 3, is_row);
end

% One stream of the code bits, lying as the bits did.
function values = stream (code, number, is_row)
  values = int8 (reshape (code(:,number,:), size (code, 1), size (code, 3)));
  if (is_row)
    values = values';
  end
end

%!test  % the systematic bits, and the parity of an impulse: (1 + D + D^3) / (1 + D^2 + D^3)
%! bits = [1, zeros(1, 39)];
%! [sys, par1, par2] = quarzel_encode (bits);
%! assert (class (sys), 'int8');
%! assert (size (par2), [1, 44]);
%! assert (sys(1:40), int8 (bits));
%! assert (par1(1:8), int8 ([1 1 1 1 0 0 1 0]));

%!test  % columns are blocks
%! bits = rand (64, 5) > 0.5;
%! [sys, par1, par2] = quarzel_encode (bits);
%! for i = 1:5
%!   [s, p, q] = quarzel_encode (bits(:,i));
%!   assert ([sys(:,i), par1(:,i), par2(:,i)], [s, p, q]);
%! end

%!test  % cells of several sizes
%! [sys, par1, par2] = quarzel_encode ({zeros(40, 1), ones(1, 48)});
%! assert (size (sys), [1, 2]);
%! assert (size (par1{2}), [1, 52]);

%!error <bits are needed> quarzel_encode ()
%!error <no block size of 41 bits; the nearest: 40, 48> quarzel_encode (zeros (41, 1))
%!error <a bit must be 0 or 1> quarzel_encode (2 * ones (40, 1))
%!error <a bit must be 0 or 1> quarzel_encode (NaN (40, 1))
%!error id=quarzel:type quarzel_encode ('text')
