% SPDX-License-Identifier: MIT

function coded = quarzel_rate_match (streams, E, varargin)
  %QUARZEL_RATE_MATCH  Select the bits of code blocks of LTE that are sent (3GPP TS 36.212, section 5.1.4.1).
  %
  %   coded = quarzel_rate_match (streams, E)
  %   coded = quarzel_rate_match (streams, E, name, value, ...)
  %   coded = quarzel_rate_match (streams, E, options)
  %
  %   streams is (K + 4) x 3 x blocks as quarzel_turbo_encode gives them, E the number of bits that are sent. coded has
  %   E rows and a column for each block, of uint8. The options:
  %
  %     rv            redundancy version, 0 (default) to 3
  %     buffer_size   N_cb, the entries of the circular buffer that are used (default: all)
  %     filler        F, filler bits in front of the block (default 0); they are never sent
  %
  %   See also quarzel_rate_recover, quarzel_turbo_encode.

  quarzel_lte_need ('quarzel_rate_match', nargin, 2, 'quarzel_rate_match (streams, E)');
  defaults = struct ('rv', 0, 'buffer_size', [], 'filler', 0);
  options = quarzel_lte_options ('quarzel_rate_match', defaults, varargin);
  if (~(islogical (streams) || isnumeric (streams)) || size (streams, 2) ~= 3 || ndims (streams) > 3)
    error ('quarzel:type', 'quarzel_rate_match: streams must be an array of (K + 4) x 3 x blocks');
  end
  bits = reshape (quarzel_lte_bits ('quarzel_rate_match', streams(:)), size (streams));
  coded = quarzel_lte_call ('quarzel_rate_match', 'rate_match', bits, E, options.rv, options.buffer_size, options.filler);
end

%!test  % a whole buffer holds each code bit once
%! streams = quarzel_turbo_encode (rand (104, 3) > 0.5, 5);
%! coded = quarzel_rate_match (streams, 3 * 108 - 10, 'filler', 5);
%! for i = 1:3
%!   assert (sum (coded(:,i)), sum (streams(:,:,i)(streams(:,:,i) == 1)));
%! end

%!test  % it begins again at its end
%! streams = quarzel_turbo_encode (rand (40, 1) > 0.5);
%! once = quarzel_rate_match (streams, 132, 'rv', 2);
%! assert (quarzel_rate_match (streams, 264, struct ('rv', 2)), [once; once]);

%!error <call quarzel_rate_match \(streams, E\)> quarzel_rate_match (1)
%!error <at least 1 coded bit, not 0> quarzel_rate_match (quarzel_turbo_encode (zeros (40, 1)), 0)
%!error <E must be a whole number> quarzel_rate_match (quarzel_turbo_encode (zeros (40, 1)), 0.5)
%!error <redundancy version must be 0 to 3, not 4> quarzel_rate_match (quarzel_turbo_encode (zeros (40, 1)), 9, 'rv', 4)
%!error <has 2 to 192 entries, not 193> quarzel_rate_match (quarzel_turbo_encode (zeros (40, 1)), 9, 'buffer_size', 193)
%!error <0 to 39 filler bits, not 40> quarzel_rate_match (quarzel_turbo_encode (zeros (40, 1)), 9, 'filler', 40)
%!error <give filler = F> quarzel_rate_match (quarzel_turbo_encode (zeros (40, 1), 8), 192)
%!error <\(K \+ 4\) x 3 x blocks> quarzel_rate_match (zeros (44, 2), 9)
%!error <streams of 43 .* nearest that have one: 44> quarzel_rate_match (zeros (43, 3), 9)
%!error <no option 'fill'; choose from rv, buffer_size, filler> quarzel_rate_match (zeros (44, 3), 9, 'fill', 1)
%!error <the option 'rv' needs a value> quarzel_rate_match (zeros (44, 3), 9, 'rv')
%!error <options must be names with values, or a struct> quarzel_rate_match (zeros (44, 3), 9, 1, 2)
