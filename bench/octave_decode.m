% SPDX-License-Identifier: MIT
% Octave's batch decode of 1,000 int8 blocks of K = 1024: information Mbit/s, the best of 7. bindings.sh compares it.
blocks = 1000;
K = 1024;
soft = cell (1, 3);
for i = 1:3
  soft{i} = int8 (round (8 * randn (K + 4, blocks) - 8));
end
best = Inf;
for i = 1:7
  start = tic ();
  quarzel_decode (soft{:}, 6);
  best = min (best, toc (start));
end
printf ('Octave        %8.1f Mbit/s\n', blocks * K * 1e-6 / best);
