% SPDX-License-Identifier: MIT

function [bits, ok] = quarzel_desegment (blocks, B)
  %QUARZEL_DESEGMENT  Put decoded code blocks of LTE together again: quarzel_segment undone.
  %
  %   [bits, ok] = quarzel_desegment (blocks, B)
  %
  %   blocks is a cell array of the decisions on the code blocks in order, as quarzel_segment orders them; what stands at
  %   filler bits does not matter. B is the number of bits of a transport block with its CRC. bits has B rows, or is a
  %   row where the blocks are. ok tells for each code block whether its CRC24B holds, true where it has none: a row for
  %   each code block, a column for each transport block.
  %
  %   See also quarzel_segment.

  quarzel_lte_need ('quarzel_desegment', nargin, 2, 'quarzel_desegment (blocks, B)');
  if (~iscell (blocks) || isempty (blocks))
    error ('quarzel:type', 'quarzel_desegment: blocks must be a cell array with a code block in each cell');
  end
  [columns, rows] = cellfun (@(block) quarzel_lte_bits ('quarzel_desegment', block), blocks(:), 'UniformOutput', false);
  counts = cellfun (@(block) size (block, 2), columns);
  if (any (counts ~= counts(1)))
    error ('quarzel:value', 'quarzel_desegment: the code blocks must have the same number of columns');
  end
  sizes = cellfun (@(block) size (block, 1), columns);
  [bits, holds] = quarzel_lte_call ('quarzel_desegment', 'desegment', vertcat (columns{:}), sizes, B);
  ok = holds ~= 0;
  if (rows{1})
    bits = bits.';
  end
end

%!test  % a wrong code block is told, filler does not matter
%! bits = uint8 (rand (6145, 2) > 0.5);
%! [blocks, filler] = quarzel_segment (bits);
%! blocks{1}(1:filler,:) = 1;
%! blocks{2}(100,2) = 1 - blocks{2}(100,2);
%! [back, ok] = quarzel_desegment (blocks, 6145);
%! assert (ok, [true true; true false]);
%! assert (nnz (back ~= bits), 1);

%!error <call quarzel_desegment \(blocks, B\)> quarzel_desegment ({0})
%!error <blocks must be a cell array> quarzel_desegment (zeros (40, 1), 40)
%!error <B = 6145 bits are cut into 2 code blocks, 1 of 3072 bits, then 1 of 3136 bits; these have 3072, 3072> ...
%! quarzel_desegment ({zeros(3072, 1), zeros(3072, 1)}, 6145)
%!error <same number of columns> quarzel_desegment ({zeros(3072, 1), zeros(3136, 2)}, 6145)
%!error <B must be a whole number> quarzel_desegment ({zeros(40, 1)}, 1.5)
%!error <at least 1 bit> quarzel_desegment ({zeros(40, 1)}, 0)
