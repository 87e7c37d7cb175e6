% SPDX-License-Identifier: MIT

% Options of the function of a name: names with values, or a struct, in place of the defaults.
function options = quarzel_lte_options (name, options, given)
  if (numel (given) == 1 && isstruct (given{1}) && isscalar (given{1}))
    given = [fieldnames(given{1}), struct2cell(given{1})]';
  end
  choices = strjoin (fieldnames (options)', ', ');
  for i = 1:2:numel (given)
    if (~ischar (given{i}))
      error ('quarzel:type', '%s: options must be names with values, or a struct; the names are %s', name, choices);
    end
    if (~isfield (options, given{i}))
      error ('quarzel:value', '%s: there is no option ''%s''; choose from %s', name, given{i}, choices);
    end
    if (i == numel (given))
      error ('quarzel:value', '%s: the option ''%s'' needs a value', name, given{i});
    end
    options.(given{i}) = given{i + 1};
  end
end
