% SPDX-License-Identifier: MIT

% Soft values as int16, a block in each column, for the function of a name.
function [columns, is_row] = quarzel_lte_soft (name, soft)
  if (~(isa (soft, 'int8') || isa (soft, 'int16') || isa (soft, 'double')) || ~isreal (soft) || ndims (soft) > 2)
    error ('quarzel:type', '%s: soft values must be a vector or matrix of int8, int16 or whole doubles, not %s', ...
           name, class (soft));
  end
  if (any (soft(:) ~= fix (soft(:))))
    error ('quarzel:value', '%s: a soft value is not a whole number; scale log-likelihood ratios and round first', name);
  end
  is_row = size (soft, 1) == 1;
  columns = int16 (full (soft));
  if (is_row)
    columns = columns.';
  end
end
