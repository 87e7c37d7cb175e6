% SPDX-License-Identifier: MIT

function streams = quarzel_turbo_encode (block, filler)
  %QUARZEL_TURBO_ENCODE  Encode code blocks of LTE that may begin with filler bits (3GPP TS 36.212, section 5.1.3.2).
  %
  %   streams = quarzel_turbo_encode (block)
  %   streams = quarzel_turbo_encode (block, filler)
  %
  %   block is a vector of K bits, or a matrix with a block in each column; the first `filler` bits of each (default 0)
  %   may be anything and count as 0. streams is (K + 4) x 3 x blocks of uint8: systematic bits, parity 1, parity 2, as
  %   quarzel_encode gives them, and 255 for the systematic and the first parity bit of filler bits.
  %
  %   See also quarzel_encode, quarzel_segment, quarzel_rate_match.

  quarzel_lte_need ('quarzel_turbo_encode', nargin, 1, 'quarzel_turbo_encode (block, filler)');
  if (nargin < 2)
    filler = 0;
  end
  columns = quarzel_lte_bits ('quarzel_turbo_encode', block);
  streams = quarzel_lte_call ('quarzel_turbo_encode', 'turbo_encode', columns, filler);
end

%!test  % without filler it is quarzel_encode
%! bits = rand (64, 5) > 0.5;
%! [sys, par1, par2] = quarzel_encode (bits);
%! streams = quarzel_turbo_encode (bits);
%! assert (class (streams), 'uint8');
%! assert (int8 (streams), permute (cat (3, sys, par1, par2), [1 3 2]));
%! assert (quarzel_turbo_encode (bits(:,2)'), streams(:,:,2));

%!test  % filler counts as 0, and is not sent
%! bits = uint8 (rand (64, 1) > 0.5);
%! [sys, par1, par2] = quarzel_encode ([zeros(9, 1, 'uint8'); bits(10:end)]);
%! streams = quarzel_turbo_encode (bits, 9);
%! assert (streams(1:9,1:2), 255 * ones (9, 2, 'uint8'));
%! assert (int8 (streams(10:end,:)), [sys(10:end), par1(10:end), par2(10:end)]);
%! assert (int8 (streams(:,3)), par2);

%!error <call quarzel_turbo_encode \(block, filler\)> quarzel_turbo_encode ()
%!error <no code block of 41 bits; the nearest sizes: 40, 48> quarzel_turbo_encode (zeros (41, 1))
%!error <0 to 39 filler bits, not 40> quarzel_turbo_encode (zeros (40, 1), 40)
%!error <filler must be 0 or more, not -1> quarzel_turbo_encode (zeros (40, 1), -1)
%!error <a bit must be 0 or 1> quarzel_turbo_encode (2 * ones (40, 1), 3)
