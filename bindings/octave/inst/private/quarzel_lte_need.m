% SPDX-License-Identifier: MIT

% Refuse a call with too few arguments: CALL is how the function of a name is called.
function quarzel_lte_need (name, count, needed, call)
  if (count < needed)
    error ('quarzel:value', '%s: arguments are missing; call %s', name, call);
  end
end
