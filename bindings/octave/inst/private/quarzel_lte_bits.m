% SPDX-License-Identifier: MIT

% Bits as uint8, a block in each column, for the function of a name. What is neither 0 nor 1 becomes 255.
function [columns, is_row] = quarzel_lte_bits (name, bits)
  if (~(islogical (bits) || isnumeric (bits)) || ndims (bits) > 2)
    error ('quarzel:type', '%s: bits must be a logical or numeric vector or matrix, not %s', name, class (bits));
  end
  is_row = size (bits, 1) == 1;
  if (is_row)
    bits = bits.';
  end
  columns = uint8 (full (bits ~= 0));
  columns(bits ~= 0 & bits ~= 1) = 255;
end
