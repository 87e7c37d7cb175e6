% SPDX-License-Identifier: MIT

function [streams, buffer] = quarzel_rate_recover (soft, K, varargin)
  %QUARZEL_RATE_RECOVER  Undo rate matching on soft values, and combine transmissions.
  %
  %   streams = quarzel_rate_recover (soft, K)
  %   [streams, buffer] = quarzel_rate_recover (soft, K, name, value, ...)
  %   [streams, buffer] = quarzel_rate_recover (soft, K, options)
  %
  %   soft is a vector of E soft values of a block of K bits, positive for bit 1, or a matrix with a block in each column;
  %   of class int8 or int16, or double when the values are whole. streams is (K + 4) x 3 x blocks of int8 for
  %   quarzel_decode: the sums, clipped to 8 bits; -128 for filler bits; 0 for what was not received. The options:
  %
  %     rv, buffer_size, filler   as for quarzel_rate_match
  %     buffer                    what an earlier call has returned as second result: the soft values are added to it
  %     width                     bits of a sum in the buffer, 2 to 16 (default 8)
  %
  %   buffer, of int16, holds a column for each block: the circular buffer in the order of the standard's w.
  %
  %   See also quarzel_rate_match, quarzel_decode.

  quarzel_lte_need ('quarzel_rate_recover', nargin, 2, 'quarzel_rate_recover (soft, K)');
  defaults = struct ('rv', 0, 'buffer_size', [], 'filler', 0, 'buffer', zeros (0, 'int16'), 'width', 8);
  options = quarzel_lte_options ('quarzel_rate_recover', defaults, varargin);
  if (~isa (options.buffer, 'int16'))
    error ('quarzel:type', 'quarzel_rate_recover: buffer must be int16, as an earlier call has returned it, not %s', ...
           class (options.buffer));
  end
  columns = quarzel_lte_soft ('quarzel_rate_recover', soft);
  [streams, buffer] = quarzel_lte_call ('quarzel_rate_recover', 'rate_recover', columns, K, options.rv, ...
                                        options.buffer_size, options.filler, options.buffer, options.width);
end

%!test  % the inverse of rate matching, for every redundancy version
%! bits = uint8 (rand (104, 3) > 0.5);
%! code = quarzel_turbo_encode (bits, 5);
%! for rv = 0:3
%!   coded = quarzel_rate_match (code, 3 * 108 - 10, 'filler', 5, 'rv', rv);
%!   streams = quarzel_rate_recover (16 * int8 (coded) - 8, 104, 'filler', 5, 'rv', rv);
%!   assert (class (streams), 'int8');
%!   expected = 16 * int8 (code) - 8;
%!   expected(code == 255) = -128;
%!   assert (streams, expected);
%!   decoded = quarzel_decode (squeeze (streams(:,1,:)), squeeze (streams(:,2,:)), squeeze (streams(:,3,:)));
%!   assert (decoded(6:end,:), bits(6:end,:));
%! end

%!test  % sums are kept, and clipped to their width
%! soft = 70 * ones (192, 2);
%! [streams, buffer] = quarzel_rate_recover (soft, 40, 'buffer_size', 150);
%! [streams, buffer] = quarzel_rate_recover (soft, 40, 'buffer_size', 150, 'buffer', buffer);
%! assert (class (buffer), 'int16');
%! assert (size (buffer), [150, 2]);
%! assert (unique (buffer), int16 ([0; 127]));
%! [~, wide] = quarzel_rate_recover (soft, 40, 'width', 9);
%! [streams, wide] = quarzel_rate_recover (soft, 40, struct ('width', 9, 'buffer', wide));
%! assert (double (max (wide(:))), 255);
%! assert (max (streams(:)), int8 (127));

%!error <call quarzel_rate_recover \(soft, K\)> quarzel_rate_recover (1)
%!error <at least 1 coded bit, not 0> quarzel_rate_recover ([], 40)
%!error <no code block of 41 bits; the nearest sizes: 40, 48> quarzel_rate_recover (1:9, 41)
%!error <redundancy version must be 0 to 3, not 4> quarzel_rate_recover (1:9, 40, 'rv', 4)
%!error <2 to 16 bits, not 1> quarzel_rate_recover (1:9, 40, 'width', 1)
%!error <192 entries in the circular buffer, not 288> quarzel_rate_recover (1:9, 40, 'buffer', zeros (288, 1, 'int16'))
%!error <2 buffers for 1 blocks; give one a block> quarzel_rate_recover (1:9, 40, 'buffer', zeros (192, 2, 'int16'))
%!error <buffer must be int16> quarzel_rate_recover (1:9, 40, 'buffer', zeros (192, 1))
%!error <not a whole number> quarzel_rate_recover (0.5, 40)
%!error <not single> quarzel_rate_recover (single (1), 40)
