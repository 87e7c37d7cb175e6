% SPDX-License-Identifier: MIT

function coded = quarzel_encode_transport_block (bits, G, varargin)
  %QUARZEL_ENCODE_TRANSPORT_BLOCK  Encode transport blocks of LTE (3GPP TS 36.212, sections 5.1.1 to 5.1.5).
  %
  %   coded = quarzel_encode_transport_block (bits, G)
  %   coded = quarzel_encode_transport_block (bits, G, name, value, ...)
  %   coded = quarzel_encode_transport_block (bits, G, options)
  %
  %   CRC, segmentation, turbo code, rate matching with whole circular buffers, concatenation. bits is a vector of A, or
  %   a matrix with a transport block in each column; coded has G bits for each, of uint8. The options:
  %
  %     scheme   'bpsk', 'qpsk' (default), '16qam', '64qam' or '256qam'
  %     layers   N_L (default 1); 2 for transmit diversity
  %     rv       redundancy version, 0 (default) to 3
  %
  %   G is a multiple of the layers times the bits of a symbol.
  %
  %   See also quarzel_decode_transport_block, quarzel_modulate.

  name = 'quarzel_encode_transport_block';
  quarzel_lte_need (name, nargin, 2, 'quarzel_encode_transport_block (bits, G)');
  options = quarzel_lte_options (name, struct ('scheme', 'qpsk', 'layers', 1, 'rv', 0), varargin);
  [columns, is_row] = quarzel_lte_bits (name, bits);
  coded = quarzel_lte_call (name, 'encode_transport_block', columns, G, options.scheme, options.layers, options.rv);
  if (is_row)
    coded = coded.';
  end
end

%!test  % the chain is its pieces: two code blocks, 16QAM
%! bits = uint8 (rand (7224, 1) > 0.5);
%! blocks = quarzel_segment ([bits; quarzel_crc24a(bits)]);
%! pieces = cellfun (@(b) quarzel_rate_match (quarzel_turbo_encode (b), 10956, 'rv', 2), blocks, 'UniformOutput', false);
%! coded = quarzel_encode_transport_block (bits, 21912, 'scheme', '16qam', 'rv', 2);
%! assert (class (coded), 'uint8');
%! assert (coded, vertcat (pieces{:}));
%! assert (quarzel_encode_transport_block (bits', 21912, struct ('scheme', '16qam', 'rv', 2)), coded');

%!error <call quarzel_encode_transport_block \(bits, G\)> quarzel_encode_transport_block (1)
%!error <multiple of 8, not 300; the nearest: 296, 304> ...
%! quarzel_encode_transport_block (zeros (99, 1), 300, 'scheme', '16qam', 'layers', 2)
%!error <at least 2 coded bits, not 0> quarzel_encode_transport_block (zeros (99, 1), 0)
%!error <layers .* must be at least 1> quarzel_encode_transport_block (zeros (99, 1), 300, 'layers', 0)
%!error <redundancy version must be 0 to 3, not 4> quarzel_encode_transport_block (zeros (99, 1), 300, 'rv', 4)
%!error <at least 1 bit, not 0> quarzel_encode_transport_block ([], 300)
%!error <a bit must be 0 or 1> quarzel_encode_transport_block (2, 300)
%!error <no option 'harq'; choose from scheme, layers, rv> quarzel_encode_transport_block (1, 300, 'harq', 4)
