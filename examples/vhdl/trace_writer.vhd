-- SPDX-License-Identifier: MIT
-- Writes signals of a decoder for `quarzel trace-diff`, a row of CSV for each value: call write_signal in a clocked process
-- beside each signal that is to be compared, all with one file. Rows may come in any order. A value with a bit that is
-- neither 0 nor 1 is written as x.

library ieee;
use ieee.std_logic_1164.all;
use ieee.numeric_std.all;
use std.textio.all;

package trace_writer is
  subtype metric is signed(11 downto 0);  -- in units of 1/8
  type metrics is array (natural range <>) of metric;

  -- Write the header, once, after the file is open.
  procedure write_header(file rows : text);

  -- Write the values that a signal has at a step.
  -- block_number, pass, step  counted from 0; pass is the number of the pass: twice the iteration, and 1 more for
  --                           constituent code 1
  -- name                      int, a, b, g, llr or ext
  -- values                    8 of a and b, by state from 0; 4 of g, from g4; else 1
  procedure write_signal(file rows : text; block_number, pass, step : natural; name : string; values : metrics);
end package;

package body trace_writer is
  procedure write_header(file rows : text) is
    variable row : line;
  begin
    write(row, string'("block,pass,step,signal,state,raw"));
    writeline(rows, row);
  end procedure;

  procedure write_signal(file rows : text; block_number, pass, step : natural; name : string; values : metrics) is
    variable row : line;
    variable number : natural := 0;
  begin
    if values'length = 4 then
      number := 4;
    end if;
    for i in values'range loop
      write(row, integer'image(block_number) & ',' & integer'image(pass) & ',' & integer'image(step) & ',' & name & ',');
      if values'length > 1 then
        write(row, integer'image(number));
      end if;
      if is_x(std_logic_vector(values(i))) then
        write(row, string'(",x"));
      else
        write(row, ',' & integer'image(to_integer(values(i))));
      end if;
      writeline(rows, row);
      number := number + 1;
    end loop;
  end procedure;
end package body;
