% SPDX-License-Identifier: MIT

function llr = quarzel_demodulate (symbols, scheme, noise_variance, method)
  %QUARZEL_DEMODULATE  The log-likelihood ratios ln P(1) / P(0) of the bits of received symbols of LTE.
  %
  %   llr = quarzel_demodulate (symbols, scheme, noise_variance)
  %   llr = quarzel_demodulate (symbols, scheme, noise_variance, method)
  %
  %   symbols is a vector, or a matrix with a block in each column; divide by the channel's gain before. scheme is as
  %   for quarzel_modulate. noise_variance is that of a symbol, real and imaginary part together: one number, or an
  %   array of the size of symbols. method is 'maxlog' (default), from the nearest symbol for each value of a bit, or
  %   'exact', from all. llr is double, and a row where symbols is one; positive means bit 1.
  %
  %   See also quarzel_modulate.

  quarzel_lte_need ('quarzel_demodulate', nargin, 3, 'quarzel_demodulate (symbols, scheme, noise_variance)');
  if (nargin < 4)
    method = 'maxlog';
  end
  if (~isnumeric (symbols) || ndims (symbols) > 2 || ~all (isfinite (symbols(:))))
    error ('quarzel:type', 'quarzel_demodulate: symbols must be a vector or matrix of finite numbers');
  end
  if (~isnumeric (noise_variance) || ~isreal (noise_variance) || ...
      ~(isscalar (noise_variance) || isequal (size (noise_variance), size (symbols))))
    error ('quarzel:value', 'quarzel_demodulate: noise_variance must be one real number, or one for each symbol');
  end
  is_row = size (symbols, 1) == 1;
  values = double (full (symbols(:))).';
  llr = quarzel_lte_call ('quarzel_demodulate', 'demodulate', [real(values); imag(values)], scheme, ...
                          double (full (noise_variance(:))), method);
  if (is_row)
    llr = llr.';
  else
    llr = reshape (llr, [], size (symbols, 2));
  end
end

%!test  % the definition, for 16QAM
%! all = quarzel_modulate ((dec2bin (0:15, 4) - '0')', '16qam');
%! bits = (dec2bin (0:15, 4) - '0') == 1;
%! symbols = randn (5, 2) + 1i * randn (5, 2);
%! variance = 0.1 + rand (5, 2);
%! exact = quarzel_demodulate (symbols, '16qam', variance, 'exact');
%! maxlog = quarzel_demodulate (symbols, '16qam', variance);
%! for n = 1:10
%!   d = -abs (symbols(n) - all) .^ 2 / variance(n);
%!   for b = 1:4
%!     one = d(bits(:,b)); zero = d(~bits(:,b));
%!     assert (exact(4 * (n - 1) + b), log (sum (exp (one)) / sum (exp (zero))), 1e-9);
%!     assert (maxlog(4 * (n - 1) + b), max (one) - max (zero), 1e-9);
%!   end
%! end

%!test  % the sign, and rows
%! for scheme = {'bpsk', 'qpsk', '16qam', '64qam', '256qam'}
%!   bits = rand (1, 48) > 0.5;
%!   assert (quarzel_demodulate (quarzel_modulate (bits, scheme{1}), scheme{1}, 0.1) > 0, bits);
%! end

%!error <call quarzel_demodulate> quarzel_demodulate (1, 'qpsk')
%!error <variance must be above 0> quarzel_demodulate (1i, 'qpsk', 0)
%!error <one real number, or one for each symbol> quarzel_demodulate (1i, 'qpsk', [1 1])
%!error <choose one of bpsk> quarzel_demodulate (1i, 'qam', 1)
%!error <no method of demodulation 'log'; choose one of exact, maxlog> quarzel_demodulate (1i, 'qpsk', 1, 'log')
%!error <finite numbers> quarzel_demodulate (NaN, 'qpsk', 1)
