% SPDX-License-Identifier: MIT
% Let each allocation inside the functions fail, by itself and with all that follow it: a call raises an error of memory
% or does its work, and the next one is good. Ends with 1 when that is not so.
randn ('state', 20261122);
rand ('state', 20261122);
soft = arrayfun (@(~) int8 (round (20 * randn (44, 3))), 1:3, 'UniformOutput', false);
block = cellfun (@(x) x(:,1), soft, 'UniformOutput', false);
bits = uint8 (rand (40, 2) > 0.5);
calls = {'decode', @() quarzel_decode(soft{:}, 2)
         'decode with max-star', @() quarzel_decode(soft{:}, 2, 'algorithm', 2)
         'trace', @() quarzel_decode(block{:}, 1, 'trace', 2)
         'encode', @() quarzel_encode(bits)
         'quantise', @() quarzel_quantise(double (soft{1}) * 0.3)};
mark = tempname ();
setenv ('QUARZEL_FAILED', mark);
for i = 1:rows (calls)
  [name, call] = calls{i,:};
  expected = call ();
  failures = 0;
  for more = {'', '+'}
    number = 0;
    do
      number++;
      result = expected;
      setenv ('QUARZEL_FAILING', sprintf ('malloc %d%s', number, more{1}));
      try
        result = call ();
      catch problem
        if (isempty (strfind (problem.message, 'memory')))
          printf ('%s, allocation %d%s: %s\n', name, number, more{1}, problem.message);
          exit (1);
        end
      end
      unsetenv ('QUARZEL_FAILING');
      failed = exist (mark, 'file');
      if (failed)
        unlink (mark);
        failures++;
        if (~isequal (result, expected) || ~isequal (call (), expected))
          printf ('%s: allocation %d%s spoils the result\n', name, number, more{1});
          exit (1);
        end
      end
    until (~failed)
  end
  printf ('%s %d\n', name, failures);
  if (failures < 6)
    exit (1);
  end
end
