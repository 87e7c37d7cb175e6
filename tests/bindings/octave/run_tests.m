% SPDX-License-Identifier: MIT
% Run the tests inside the functions on the path and end with 1 when one fails or there are none.
failed = false;
for name = {'quarzel_decode', 'quarzel_encode'}
  [passed, all] = test (name{1}, 'quiet', stdout ());
  printf ('%s: %d of %d tests passed\n', name{1}, passed, all);
  failed = failed || all == 0 || passed ~= all;
end
exit (double (failed));
