% SPDX-License-Identifier: MIT

function parity = quarzel_crc24a (bits)
  %QUARZEL_CRC24A  The parity bits of a transport block of LTE (3GPP TS 36.212, section 5.1.1).
  %
  %   parity = quarzel_crc24a (bits)
  %
  %   bits is a vector, or a matrix with a block in each column. parity holds 24 bits for each, of class uint8. Those of
  %   a block that ends with its parity bits, and is right, are 0.
  %
  %   See also quarzel_crc24b, quarzel_segment.

  quarzel_lte_need ('quarzel_crc24a', nargin, 1, 'quarzel_crc24a (bits)');
  [columns, is_row] = quarzel_lte_bits ('quarzel_crc24a', bits);
  parity = quarzel_lte_call ('quarzel_crc24a', 'crc', 'crc24a', columns);
  if (is_row)
    parity = parity.';
  end
end

%!test  % the remainder of a long division
%! powers = [24 23 18 17 14 11 10 7 6 5 4 3 1 0];
%! for n = [2 8 41]
%!   bits = rand (n, 3) > 0.5;
%!   parity = quarzel_crc24a (bits);
%!   assert (class (parity), 'uint8');
%!   for column = 1:3
%!     rest = [bits(:,column); false(24, 1)];
%!     for i = 1:n
%!       if (rest(i))
%!         rest(i + 24 - powers) = ~rest(i + 24 - powers);
%!       end
%!     end
%!     assert (parity(:,column), uint8 (rest(n+1:end)));
%!   end
%!   assert (~any (quarzel_crc24a ([bits; parity])(:)));
%!   assert (quarzel_crc24a (bits(:,1)'), parity(:,1)');
%! end

%!error <call quarzel_crc24a \(bits\)> quarzel_crc24a ()
%!error <a bit must be 0 or 1> quarzel_crc24a ([0 1 2])
%!error id=quarzel:type quarzel_crc24a ('text')
