% SPDX-License-Identifier: MIT

function [blocks, filler] = quarzel_segment (bits)
  %QUARZEL_SEGMENT  Cut transport blocks of LTE into code blocks (3GPP TS 36.212, section 5.1.2).
  %
  %   [blocks, filler] = quarzel_segment (bits)
  %
  %   bits, each transport block with its CRC, is a vector of B, or a matrix with one in each column. blocks is a cell
  %   array with a code block, of uint8, in each cell, or a matrix of as many columns. When there are several, each ends
  %   with its CRC24B. The first begins with `filler` filler bits, of value 255.
  %
  %   See also quarzel_desegment, quarzel_crc24a, quarzel_turbo_encode.

  quarzel_lte_need ('quarzel_segment', nargin, 1, 'quarzel_segment (bits)');
  [columns, is_row] = quarzel_lte_bits ('quarzel_segment', bits);
  [all, sizes, filler] = quarzel_lte_call ('quarzel_segment', 'segment', columns);
  blocks = mat2cell (all, sizes, size (all, 2))';
  if (is_row)
    blocks = cellfun (@(block) block.', blocks, 'UniformOutput', false);
  end
end

%!test  % one block, with filler
%! bits = rand (100, 2) > 0.5;
%! [blocks, filler] = quarzel_segment (bits);
%! assert (filler, 4);
%! assert (blocks, {[255 * ones(4, 2, 'uint8'); uint8(bits)]});

%!test  % there and back, for 1 to 13 code blocks
%! for C = 1:13
%!   B = 6120 * C - randi (6000);
%!   bits = uint8 (rand (B, 1) > 0.5);
%!   [blocks, filler] = quarzel_segment (bits);
%!   assert (size (blocks), [1, C]);
%!   assert (sum (cellfun (@numel, blocks)), B + filler + (C > 1) * 24 * C);
%!   if (C > 1)
%!     assert (~any (quarzel_crc24b (blocks{C})));
%!   end
%!   [back, ok] = quarzel_desegment (blocks, B);
%!   assert (back, bits);
%!   assert (ok, true (C, 1));
%!   [blocks, ~] = quarzel_segment (bits');
%!   assert (quarzel_desegment (blocks, B), bits');
%! end

%!error <call quarzel_segment \(bits\)> quarzel_segment ()
%!error <at least 1 bit to cut into code blocks, not 0> quarzel_segment ([])
%!error <a bit must be 0 or 1> quarzel_segment ([0 NaN])
