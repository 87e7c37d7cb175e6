-- SPDX-License-Identifier: MIT
-- Writes the values of values.txt, lines of pass, step and log-likelihood ratio, to simulation.csv by trace_writer, with the
-- ratio of one step unknown where the generic says so.

library ieee;
use ieee.std_logic_1164.all;
use ieee.numeric_std.all;
use std.textio.all;
use work.trace_writer.all;

entity trace_writer_test is
  generic (unknown_step : integer := -1);
end entity;

architecture bench of trace_writer_test is
begin
  process
    file values : text open read_mode is "values.txt";
    file rows : text open write_mode is "simulation.csv";
    variable row : line;
    variable pass, step, ratio : integer;
    variable value : metric;
  begin
    write_header(rows);
    while not endfile(values) loop
      readline(values, row);
      read(row, pass);
      read(row, step);
      read(row, ratio);
      value := to_signed(ratio, 12);
      if step = unknown_step then
        value(3) := 'X';
      end if;
      write_signal(rows, 0, pass, step, "llr", (0 => value));
    end loop;
    wait;
  end process;
end architecture;
