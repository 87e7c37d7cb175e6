% SPDX-License-Identifier: MIT
% The coding chain on the stored cases, which lie in the folder that QUARZEL_DATA names.

%!function cases = stored (name)
%!  lines = strsplit (strtrim (fileread (fullfile (getenv ('QUARZEL_DATA'), name))), "\n");
%!  cases = cellfun (@jsondecode, lines, 'UniformOutput', false);
%!endfunction

%!function bits = bits_of_hex (digits, count)
%!  nibbles = dec2bin (hex2dec (digits(:)), 4)' - '0';
%!  bits = uint8 (nibbles(1:count)');
%!endfunction

%!test  % the published coded bits come out
%! cases = stored ('rate_matching.jsonl');
%! assert (numel (cases), 3);
%! for i = 1:3
%!   one = cases{i};
%!   streams = quarzel_turbo_encode (bits_of_hex (one.bits, one.K));
%!   coded = quarzel_rate_match (streams, one.E, 'rv', one.rv, 'buffer_size', one.Ncb);
%!   assert (coded, bits_of_hex (one.matched, one.E));
%! end

%!test  % the published circular buffers decode to their bits
%! cases = stored ('circular_buffers.jsonl');
%! assert (numel (cases), 2);
%! for i = 1:2
%!   one = cases{i};
%!   [streams, buffer] = quarzel_rate_recover (0, one.K, 'buffer', int16 (one.soft));
%!   assert (buffer, int16 (one.soft));
%!   decoded = quarzel_decode (streams(:,1), streams(:,2), streams(:,3), 8);
%!   assert (decoded, bits_of_hex (one.hard, one.K));
%! end
