% SPDX-License-Identifier: MIT

function [bits, ok, buffers] = quarzel_decode_transport_block (soft, A, varargin)
  %QUARZEL_DECODE_TRANSPORT_BLOCK  Decode transport blocks of LTE, and combine transmissions.
  %
  %   [bits, ok, buffers] = quarzel_decode_transport_block (soft, A)
  %   [bits, ok, buffers] = quarzel_decode_transport_block (soft, A, name, value, ...)
  %   [bits, ok, buffers] = quarzel_decode_transport_block (soft, A, options)
  %
  %   soft is a vector of the soft values of a transport block of A bits, positive for bit 1, or a matrix with one in
  %   each column; of class int8 or int16, or double when the values are whole. bits holds A decisions for each, of
  %   uint8; ok tells whether its CRC holds; buffers is for the next transmission. The options:
  %
  %     scheme, layers, rv   as for quarzel_encode_transport_block
  %     iterations           of the core, 1 to 15 (default 8)
  %     units, algorithm     of the core, as for quarzel_decode (default 8 and 'scaled-max-log')
  %     buffers              what the call for an earlier transmission has returned
  %
  %   See also quarzel_encode_transport_block, quarzel_demodulate.

  name = 'quarzel_decode_transport_block';
  quarzel_lte_need (name, nargin, 2, 'quarzel_decode_transport_block (soft, A)');
  defaults = struct ('scheme', 'qpsk', 'layers', 1, 'rv', 0, 'iterations', 8, 'units', 8, ...
                     'algorithm', 'scaled-max-log', 'buffers', zeros (0, 'int16'));
  options = quarzel_lte_options (name, defaults, varargin);
  if (~isa (options.buffers, 'int16'))
    error ('quarzel:type', '%s: buffers must be int16, as an earlier call has returned them, not %s', name, ...
           class (options.buffers));
  end
  [columns, is_row] = quarzel_lte_soft (name, soft);
  [bits, ok, buffers] = quarzel_lte_call (name, 'decode_transport_block', columns, A, options.scheme, ...
                                          options.layers, options.rv, options.iterations, options.units, ...
                                          options.algorithm, options.buffers);
  ok = ok ~= 0;
  if (is_row)
    bits = bits.';
  end
end

%!test  % there and back, for 1 to 13 code blocks
%! schemes = {'bpsk', 'qpsk', '16qam', '64qam', '256qam'};
%! for C = 1:13
%!   A = 6120 * C - 24 - randi (6000);
%!   options = struct ('scheme', schemes{1 + mod (C, 5)}, 'layers', 1 + mod (C, 2), 'rv', mod (C, 4));
%!   bits = uint8 (rand (A, 1) > 0.5);
%!   coded = quarzel_encode_transport_block (bits, 48 * ceil (3 * A / 48), options);
%!   [decided, ok] = quarzel_decode_transport_block (16 * int8 (coded) - 8, A, options);
%!   assert (decided, bits);
%!   assert (ok, true);
%! end

%!test  % transmissions that are too short alone, for several blocks
%! bits = uint8 (rand (1000, 3) > 0.5);
%! buffers = zeros (0, 'int16');
%! for rv = [0 2 3 1]
%!   soft = 8 * double (quarzel_encode_transport_block (bits, 800, 'rv', rv)) - 4;
%!   [decided, ok, buffers] = quarzel_decode_transport_block (soft, 1000, 'rv', rv, 'buffers', buffers, 'units', 2);
%!   if (rv == 0)
%!     assert (ok, false (1, 3));
%!   end
%! end
%! assert (ok, true (1, 3));
%! assert (decided, bits);
%! assert (class (buffers), 'int16');
%! [decided, ok] = quarzel_decode_transport_block (soft(:,2)', 1000, 'rv', 1, 'buffers', buffers(:,2), 'algorithm', 2);
%! assert (decided, bits(:,2)');

%!error <call quarzel_decode_transport_block \(soft, A\)> quarzel_decode_transport_block (1)
%!error <at least 1 bit, not 0> quarzel_decode_transport_block (zeros (300, 1), 0)
%!error <multiple of 2, not 299; the nearest: 298, 300> quarzel_decode_transport_block (zeros (299, 1), 100)
%!error <A = 100 bits have soft buffers of 388 values, one in each of 1 columns, not 684 x 1> ...
%! [~, ~, other] = quarzel_decode_transport_block (zeros (300, 1), 200);
%! quarzel_decode_transport_block (zeros (300, 1), 100, 'buffers', other)
%!error <buffers must be int16> quarzel_decode_transport_block (zeros (300, 1), 100, 'buffers', zeros (388, 1))
%!error <iterations must be a number from 1 to 15, not 16> ...
%! quarzel_decode_transport_block (zeros (300, 1), 100, 'iterations', 16)
%!error <units must be 2, 4 or 8, not 3> quarzel_decode_transport_block (zeros (300, 1), 100, 'units', 3)
%!error <no algorithm 'log'> quarzel_decode_transport_block (zeros (300, 1), 100, 'algorithm', 'log')
%!error <not a whole number> quarzel_decode_transport_block (0.5, 100)
