-- SPDX-License-Identifier: MIT
-- Decodes, encodes, tags, traces, warnings and refusals of quarzel_pkg. With unknown=true a soft value has an X, which must
-- stop the simulation.

library ieee;
use ieee.std_logic_1164.all;
use std.textio.all;
use work.quarzel_pkg.all;

entity package_calls_test is
  generic (unknown : boolean := false);
end entity;

architecture test of package_calls_test is

  procedure check(good : boolean; what : string) is
    variable message : line;
  begin
    assert good report "failed: " & what severity failure;
    write(message, "ok: " & what);
    writeline(output, message);
  end;

  procedure print(text : string) is
    variable message : line;
  begin
    write(message, text);
    writeline(output, message);
  end;

  impure function soft_of(model : quarzel_handle; stream, position : integer) return integer is
  begin
    return 16 * quarzel_code_bit(model, stream, position) - 8;
  end;

begin
  process
    constant K : integer := 40;
    variable model, other : quarzel_handle;
    variable same : boolean := true;
  begin
    model := quarzel_open(8, 2, 8);
    check(quarzel_error(model) = "", "a core is made");
    for i in 0 to K - 1 loop
      quarzel_push_bit(model, (i * i / 3) mod 2);
    end loop;
    check(quarzel_encode(model) = K + 4, "encode gives K + 4 positions");
    check(quarzel_trace_next(model, 2, "trace.txt") = 0, "a trace is asked for");
    for i in 0 to K + 3 loop
      quarzel_push(model, soft_of(model, 0, i), soft_of(model, 1, i), soft_of(model, 2, i));
    end loop;
    check(quarzel_run(model, 6, 16#107#) = K, "a block is decoded");
    for i in 0 to K - 1 loop
      same := same and quarzel_pop(model) = (i * i / 3) mod 2;
    end loop;
    check(same, "every bit is as sent");
    check(quarzel_tag(model) = 7, "the tag comes back masked");
    print("warning: " & quarzel_next_warning(model));
    check(quarzel_next_warning(model) = "", "a warning comes once");

    check(quarzel_soft(x"80") = -128 and quarzel_soft(x"7f") = 127 and quarzel_soft(x"ff") = -1, "soft values are signed");
    quarzel_push(model, -1000, 0, 0);
    for i in 1 to K + 3 loop
      quarzel_push(model, 0, 0, 0);
    end loop;
    check(quarzel_run(model, 1, 0) = K, "values that are too large saturate");
    print("warning: " & quarzel_next_warning(model));

    -- What is refused, with the remedy.
    while quarzel_pop(model) >= 0 loop null; end loop;
    print(quarzel_error(model));
    quarzel_push(model, 0, 0, 0);
    check(quarzel_run(model, 6, 0) = -1, "no block has one position");
    print(quarzel_error(model));
    check(quarzel_code_bit(model, 3, 0) = -1, "there is no fourth stream");
    print(quarzel_error(model));
    check(quarzel_trace_next(model, 0, "trace.txt") = -1, "no passes");
    print(quarzel_error(model));
    other := quarzel_open(3, 1, 8);
    print(quarzel_error(other));
    check(quarzel_close(model) = 0, "close");
    check(quarzel_close(model) = -1, "close again");
    print(quarzel_error(model));

    if unknown then
      print(integer'image(quarzel_soft("000000X0")));
    end if;
    wait;
  end process;
end architecture;
