-- SPDX-License-Identifier: MIT
-- A stand-in for a decoder: when the soft values of a block are in, it takes the block's decisions from a file and shifts
-- them out, one bit a cycle. error_block and error_bit choose a decision that it gets wrong.

library ieee;
use ieee.std_logic_1164.all;
use std.textio.all;
use work.hex_files.all;

entity replay is
  generic (
    decisions : string;
    error_block : integer := -1;
    error_bit : natural := 0
  );
  port (
    clk, in_valid, in_last : in std_logic;
    systematic, parity1, parity2 : in std_logic_vector(7 downto 0);  -- which a true decoder would use
    k : in natural;
    out_valid, out_bit : out std_logic
  );
end entity;

architecture model of replay is
begin
  process
    file decided : text open read_mode is decisions;
    variable decision : natural;
    variable length : natural;
    variable blocks : natural := 0;
  begin
    out_valid <= '0';
    wait until rising_edge(clk) and in_valid = '1' and in_last = '1';
    length := k;
    for i in 0 to length - 1 loop
      next_word(decided, decision);
      if blocks = error_block and i = error_bit then
        decision := 1 - decision;
      end if;
      out_valid <= '1';
      out_bit <= '1' when decision = 1 else '0';
      wait until rising_edge(clk);
    end loop;
    blocks := blocks + 1;
  end process;
end architecture;
