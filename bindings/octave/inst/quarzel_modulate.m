% SPDX-License-Identifier: MIT

function symbols = quarzel_modulate (bits, scheme)
  %QUARZEL_MODULATE  Turn bits into symbols of LTE, of mean energy 1 (3GPP TS 36.211, section 7.1).
  %
  %   symbols = quarzel_modulate (bits, scheme)
  %
  %   bits is a vector, or a matrix with a block in each column. scheme is 'bpsk', 'qpsk', '16qam', '64qam' or '256qam'.
  %   symbols is complex, and a row where bits is one.
  %
  %   See also quarzel_demodulate.

  quarzel_lte_need ('quarzel_modulate', nargin, 2, 'quarzel_modulate (bits, scheme)');
  [columns, is_row] = quarzel_lte_bits ('quarzel_modulate', bits);
  parts = quarzel_lte_call ('quarzel_modulate', 'modulate', columns, scheme);
  symbols = reshape (complex (parts(1,:), parts(2,:)), [], size (columns, 2));
  if (is_row)
    symbols = symbols.';
  end
end

%!test  % signs and nested distances
%! s = 1 - 2 * (dec2bin (0:63, 6) - '0')';
%! level = @(s) s(1,:) .* (4 - s(2,:) .* (2 - s(3,:)));
%! expected = (level (s(1:2:end,:)) + 1i * level (s(2:2:end,:))) / sqrt (42);
%! assert (quarzel_modulate (s < 0, '64qam'), expected, 4 * eps);

%!test  % rows, columns, matrices
%! bits = rand (16, 3) > 0.5;
%! for scheme = {'bpsk', 'qpsk', '16qam', '256qam'}
%!   symbols = quarzel_modulate (bits, scheme{1});
%!   assert (size (symbols, 2), 3);
%!   assert (quarzel_modulate (bits(:,2)', scheme{1}), symbols(:,2).');
%! end
%! assert (quarzel_modulate ([0 0; 0 1; 0 0; 0 1], 'bpsk')(:,2), [1; -1; 1; -1] * (1 + 1i) / sqrt (2), eps);

%!error <call quarzel_modulate \(bits, scheme\)> quarzel_modulate (1)
%!error <must be a multiple of 4, not 3; the nearest: 0, 4> quarzel_modulate ([0 1 1], '16qam')
%!error <no modulation '8psk'; choose one of bpsk, qpsk, 16qam, 64qam, 256qam> quarzel_modulate ([0 1 1], '8psk')
%!error <choose one of bpsk> quarzel_modulate ([0 1], 4)
%!error <a bit must be 0 or 1> quarzel_modulate ([0 2], 'qpsk')
