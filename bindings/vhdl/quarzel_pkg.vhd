-- SPDX-License-Identifier: MIT
-- The model of the turbo decoder core for VHDL, over VHPIDIRECT. The library is that of the SystemVerilog package; the
-- loader must find libquarzel_dpi.so.
--
-- Soft values are integers in units of 1/8, POSITIVE MEANS BIT 1. A block of K bits comes as K + 4 positions, the tail in
-- the last 4. Functions that return -1 say by it that something is wrong, and quarzel_error tells what.

library ieee;
use ieee.std_logic_1164.all;
use ieee.numeric_std.all;

package quarzel_pkg is

  -- A model of one core.
  type quarzel_handle is range 0 to 4611686018427387903;

  -- A new model with 2, 4 or 8 processing units; algorithm 0 max-log, 1 max-log with scaled extrinsic values, 2 max-star.
  -- Always a handle, whose error tells whether it can be used.
  impure function quarzel_open(processing_units, algorithm, tag_width : integer) return quarzel_handle;
  -- Free the model. 0, or -1 when it was closed before.
  impure function quarzel_close(handle : quarzel_handle) return integer;
  -- What went wrong in the last call with this handle; empty when nothing did.
  impure function quarzel_error(handle : quarzel_handle) return string;
  -- The next warning of the model; empty when there is none.
  impure function quarzel_next_warning(handle : quarzel_handle) return string;

  -- A soft value of 8 bits as an integer. A bit that is neither 0 nor 1 is a failure, which ends the simulation.
  function quarzel_soft(value : std_logic_vector(7 downto 0)) return integer;
  -- Push K + 4 positions, run (K, or -1), pop K bits (-1 when none is left).
  procedure quarzel_push(handle : quarzel_handle; systematic, parity1, parity2 : integer);
  impure function quarzel_run(handle : quarzel_handle; iterations, tag : integer) return integer;
  impure function quarzel_pop(handle : quarzel_handle) return integer;
  -- The tag of the last decoded block, masked to the tag width.
  impure function quarzel_tag(handle : quarzel_handle) return integer;
  -- Write a trace of the first passes (two an iteration) of the next block to a file. 0, or -1.
  impure function quarzel_trace_next(handle : quarzel_handle; passes : integer; file_name : string) return integer;

  -- Push K bits, 0 or 1, encode (K + 4 positions, or -1), read the code bits of stream 0 systematic, 1 and 2 parities.
  procedure quarzel_push_bit(handle : quarzel_handle; value : integer);
  impure function quarzel_encode(handle : quarzel_handle) return integer;
  impure function quarzel_code_bit(handle : quarzel_handle; stream, position : integer) return integer;

  attribute foreign of quarzel_open : function is "VHPIDIRECT libquarzel_dpi.so quarzel_dpi_open";
  attribute foreign of quarzel_close : function is "VHPIDIRECT libquarzel_dpi.so quarzel_dpi_close";
  attribute foreign of quarzel_push : procedure is "VHPIDIRECT libquarzel_dpi.so quarzel_dpi_push";
  attribute foreign of quarzel_run : function is "VHPIDIRECT libquarzel_dpi.so quarzel_dpi_run";
  attribute foreign of quarzel_pop : function is "VHPIDIRECT libquarzel_dpi.so quarzel_dpi_pop";
  attribute foreign of quarzel_tag : function is "VHPIDIRECT libquarzel_dpi.so quarzel_dpi_tag";
  attribute foreign of quarzel_push_bit : procedure is "VHPIDIRECT libquarzel_dpi.so quarzel_dpi_push_bit";
  attribute foreign of quarzel_encode : function is "VHPIDIRECT libquarzel_dpi.so quarzel_dpi_encode";
  attribute foreign of quarzel_code_bit : function is "VHPIDIRECT libquarzel_dpi.so quarzel_dpi_code_bit";

end package;


package body quarzel_pkg is

  -- Bodies that the language asks for; the simulator calls the library instead.
  constant not_called : string := "this simulator does not call libquarzel_dpi.so";
  impure function quarzel_open(processing_units, algorithm, tag_width : integer) return quarzel_handle is
  begin report not_called severity failure; return 0; end;
  impure function quarzel_close(handle : quarzel_handle) return integer is
  begin report not_called severity failure; return -1; end;
  procedure quarzel_push(handle : quarzel_handle; systematic, parity1, parity2 : integer) is
  begin report not_called severity failure; end;
  impure function quarzel_run(handle : quarzel_handle; iterations, tag : integer) return integer is
  begin report not_called severity failure; return -1; end;
  impure function quarzel_pop(handle : quarzel_handle) return integer is
  begin report not_called severity failure; return -1; end;
  impure function quarzel_tag(handle : quarzel_handle) return integer is
  begin report not_called severity failure; return -1; end;
  procedure quarzel_push_bit(handle : quarzel_handle; value : integer) is
  begin report not_called severity failure; end;
  impure function quarzel_encode(handle : quarzel_handle) return integer is
  begin report not_called severity failure; return -1; end;
  impure function quarzel_code_bit(handle : quarzel_handle; stream, position : integer) return integer is
  begin report not_called severity failure; return -1; end;

  -- Texts of C end with a NUL. Those of the library are shorter.
  subtype c_text is string(1 to 4096);
  type c_text_pointer is access c_text;
  impure function c_error(handle : quarzel_handle) return c_text_pointer;
  attribute foreign of c_error : function is "VHPIDIRECT libquarzel_dpi.so quarzel_dpi_error";
  impure function c_error(handle : quarzel_handle) return c_text_pointer is
  begin report not_called severity failure; return null; end;
  impure function c_next_warning(handle : quarzel_handle) return c_text_pointer;
  attribute foreign of c_next_warning : function is "VHPIDIRECT libquarzel_dpi.so quarzel_dpi_next_warning";
  impure function c_next_warning(handle : quarzel_handle) return c_text_pointer is
  begin report not_called severity failure; return null; end;
  impure function c_trace_next(handle : quarzel_handle; passes : integer; file_name : c_text) return integer;
  attribute foreign of c_trace_next : function is "VHPIDIRECT libquarzel_dpi.so quarzel_dpi_trace_next";
  impure function c_trace_next(handle : quarzel_handle; passes : integer; file_name : c_text) return integer is
  begin report not_called severity failure; return -1; end;

  impure function quarzel_error(handle : quarzel_handle) return string is
    variable text : c_text_pointer := c_error(handle);
    variable length : natural := 0;
  begin
    while text(length + 1) /= nul loop length := length + 1; end loop;
    return text(1 to length);
  end;

  impure function quarzel_next_warning(handle : quarzel_handle) return string is
    variable text : c_text_pointer := c_next_warning(handle);
    variable length : natural := 0;
  begin
    while text(length + 1) /= nul loop length := length + 1; end loop;
    return text(1 to length);
  end;

  impure function quarzel_trace_next(handle : quarzel_handle; passes : integer; file_name : string) return integer is
    variable text : c_text := (others => nul);
  begin
    assert file_name'length < text'length report "the name of the trace file is too long" severity failure;
    text(1 to file_name'length) := file_name;
    return c_trace_next(handle, passes, text);
  end;

  function quarzel_soft(value : std_logic_vector(7 downto 0)) return integer is
  begin
    assert not is_x(value) report "a soft value has bits that are neither 0 nor 1" severity failure;
    return to_integer(signed(value));
  end;

end package body;
