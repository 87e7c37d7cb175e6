-- SPDX-License-Identifier: MIT
-- A self-checking test bench over a core's files of `quarzel vectors`: it drives the device block by block, compares each
-- decision, and writes all of them to simulated.hex for `quarzel compare`. Blocks and bits count from 0. The generics
-- error_block and error_bit let the device make a mistake.

library ieee;
use ieee.std_logic_1164.all;
use ieee.numeric_std.all;
use std.env.all;
use std.textio.all;
use work.hex_files.all;

entity vectors_bench is
  generic (
    directory : string := "vectors/u8_a1";
    error_block : integer := -1;
    error_bit : natural := 0
  );
end entity;

architecture bench of vectors_bench is
  signal clk, in_valid, in_last : std_logic := '0';
  signal systematic, parity1, parity2 : std_logic_vector(7 downto 0) := (others => '0');
  signal k : natural := 40;
  signal out_valid, out_bit : std_logic;
begin

  clk <= not clk after 5 ns;

  device : entity work.replay
    generic map (decisions => directory & "/dout.hex", error_block => error_block, error_bit => error_bit)
    port map (clk, in_valid, in_last, systematic, parity1, parity2, k, out_valid, out_bit);

  process
    file block_words : text open read_mode is directory & "/blocks.hex";
    file systematic_words : text open read_mode is directory & "/rsc1_sys.hex";
    file parity1_words : text open read_mode is directory & "/rsc1_par.hex";
    file parity2_words : text open read_mode is directory & "/rsc2_par.hex";
    file expected_words : text open read_mode is directory & "/dout.hex";
    file simulated_words : text open write_mode is "simulated.hex";
    variable words, simulated, message : line;
    variable block_size, iterations, soft, decision : natural;
    variable blocks, bits, errors : natural := 0;
    variable expected : std_logic;

    -- A soft value on its way to the device.
    procedure drive(file soft_words : text; signal port_of_device : out std_logic_vector(7 downto 0)) is
    begin
      next_word(soft_words, soft);
      port_of_device <= std_logic_vector(to_unsigned(soft, 8));
    end;
  begin
    next_line(block_words, words);
    loop
      -- The addresses that follow are not needed here: all files go on where the block before ended.
      read_word(words, block_size);
      read_word(words, iterations);
      k <= block_size;
      for i in 0 to block_size + 3 loop
        wait until falling_edge(clk);
        in_valid <= '1';
        in_last <= '1' when i = block_size + 3 else '0';
        drive(systematic_words, systematic);
        drive(parity1_words, parity1);
        drive(parity2_words, parity2);
      end loop;
      wait until falling_edge(clk);
      in_valid <= '0';
      in_last <= '0';
      for i in 0 to block_size - 1 loop
        while out_valid /= '1' loop
          wait until falling_edge(clk);
        end loop;
        next_word(expected_words, decision);
        expected := '1' when decision = 1 else '0';
        if out_bit /= expected then
          if errors = 0 then
            write(message, "block " & to_string(blocks) & ": bit " & to_string(i) & " is " & to_string(out_bit)
                           & ", the model gives " & to_string(expected));
            writeline(output, message);
          end if;
          errors := errors + 1;
        end if;
        write(simulated, to_string(out_bit));
        writeline(simulated_words, simulated);
        wait until falling_edge(clk);
      end loop;
      blocks := blocks + 1;
      bits := bits + block_size;
      exit when endfile(block_words);
      next_line(block_words, words);
    end loop;
    assert errors = 0 report to_string(errors) & " of " & to_string(bits) & " bits differ" severity failure;
    write(message, to_string(blocks) & " blocks are those of the model");
    writeline(output, message);
    finish;
  end process;

end architecture;
