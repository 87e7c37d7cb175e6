// SPDX-License-Identifier: MIT
// Writes a signal of a decoder for `quarzel trace-diff`, a row of CSV for each value: place one instance beside each
// signal that is to be compared, all with one file, whose header the bench writes. Rows may come in any order. A value
// that is unknown is written as x, or as X where only some of its bits are.

module trace_writer #(
    parameter SIGNAL = "a",  // int, a, b, g, llr or ext
    parameter COUNT = 8,     // values of a step: 8 of a and b, 4 of g, else 1
    parameter FIRST = 0,     // number of the first one: 4 of g, else 0
    parameter WIDTH = 12
) (
    input                          clk,
    input                          valid,   // the values are those of the step
    input signed [31:0]            file,
    input signed [31:0]            block,
    input signed [31:0]            pass,  // twice the iteration, and 1 more for constituent code 1
    input signed [31:0]            step,
    input        [COUNT*WIDTH-1:0] values   // the first one lowest, signed, in units of 1/8
);
  integer i;
  reg signed [WIDTH-1:0] value;

  always @(posedge clk) begin
    if (valid) begin
      for (i = 0; i < COUNT; i = i + 1) begin
        value = values[WIDTH*i+:WIDTH];
        if (COUNT == 1) $fdisplay(file, "%0d,%0d,%0d,%0s,,%0d", block, pass, step, SIGNAL, value);
        else $fdisplay(file, "%0d,%0d,%0d,%0s,%0d,%0d", block, pass, step, SIGNAL, FIRST + i, value);
      end
    end
  end
endmodule
