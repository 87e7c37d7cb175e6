% SPDX-License-Identifier: MIT
% Run the tests inside the functions of the package and those beside this file. End with 1 when one fails or a file has
% none.
inside = dir (fullfile (fileparts (which ('quarzel_decode')), 'quarzel_*.m'));
beside = dir (fullfile (fileparts (mfilename ('fullpath')), 'quarzel_*.m'));
failed = false;
for file = [inside; beside]'
  if (strcmp (file.name, 'quarzel_mex.m'))
    continue
  end
  [passed, all] = test (fullfile (file.folder, file.name), 'quiet', stdout ());
  printf ('%s: %d of %d tests passed\n', file.name, passed, all);
  failed = failed || all == 0 || passed ~= all;
end
exit (double (failed));
