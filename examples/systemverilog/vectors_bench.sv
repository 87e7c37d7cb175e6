// SPDX-License-Identifier: MIT
// A self-checking test bench without DPI, for Icarus Verilog among others: it reads a core's files of `quarzel vectors`,
// drives the device block by block, compares each decision, and writes all of them to simulated.hex for `quarzel compare`.
// Compile with the directory of the core on the include path and as the macro VECTORS. The plus arguments +error_block=N
// +error_bit=N let the device make a mistake. Blocks and bits count from 0.

// A stand-in for a decoder: a register that takes the decisions of a block from a memory when its soft values are in,
// and shifts them out, one bit a cycle.
module replay #(
    parameter DOUT_WORDS = 1,
    parameter MAX_K = 40
) (
    input             clk,
    input             in_valid,
    input             in_last,
    input      [7:0]  systematic,
    input      [7:0]  parity1,
    input      [7:0]  parity2,
    input      [31:0] K,
    output            out_valid,
    output            out_bit
);
  reg decided [0:DOUT_WORDS-1];
  reg [0:MAX_K-1] shift;
  integer next = 0;
  integer left = 0;
  integer i;

  assign out_valid = left > 0;
  assign out_bit = shift[0];

  always @(posedge clk) begin
    if (in_valid && in_last) begin
      for (i = 0; i < K; i = i + 1) shift[i] <= decided[next+i];
      next <= next + K;
      left <= K;
    end else if (left > 0) begin
      shift <= shift << 1;
      left <= left - 1;
    end
  end
endmodule


module vectors_bench;
  `include "config.vh"

  reg [31:0] blocks   [0:4*BLOCKS-1];  // K, iterations, address of the first soft value and of the first decision
  reg [7:0]  rsc1_sys [0:SOFT_WORDS-1];
  reg [7:0]  rsc1_par [0:SOFT_WORDS-1];
  reg [7:0]  rsc2_par [0:SOFT_WORDS-1];
  reg        expected [0:DOUT_WORDS-1];
  reg        decided  [0:DOUT_WORDS-1];

  reg clk = 0;
  always #5 clk = !clk;

  reg in_valid = 0;
  reg in_last = 0;
  reg [7:0] systematic, parity1, parity2;
  reg [31:0] K;
  wire out_valid, out_bit;
  replay #(.DOUT_WORDS(DOUT_WORDS), .MAX_K(MAX_K)) device (
      .clk(clk), .in_valid(in_valid), .in_last(in_last), .systematic(systematic), .parity1(parity1),
      .parity2(parity2), .K(K), .out_valid(out_valid), .out_bit(out_bit));

  integer b, i, soft_at, dout_at, error_block, error_bit, errors;

  initial begin
    $readmemh({`VECTORS, "/blocks.hex"}, blocks);
    $readmemh({`VECTORS, "/rsc1_sys.hex"}, rsc1_sys);
    $readmemh({`VECTORS, "/rsc1_par.hex"}, rsc1_par);
    $readmemh({`VECTORS, "/rsc2_par.hex"}, rsc2_par);
    $readmemh({`VECTORS, "/dout.hex"}, expected);
    $readmemh({`VECTORS, "/dout.hex"}, device.decided);
    if (!$value$plusargs("error_bit=%d", error_bit)) error_bit = 0;
    if ($value$plusargs("error_block=%d", error_block)) begin
      dout_at = blocks[4*error_block+3] + error_bit;
      device.decided[dout_at] = !device.decided[dout_at];
    end
    errors = 0;
    for (b = 0; b < BLOCKS; b = b + 1) begin
      K = blocks[4*b];
      soft_at = blocks[4*b+2];
      dout_at = blocks[4*b+3];
      for (i = 0; i < K + 4; i = i + 1) begin
        @(negedge clk);
        in_valid = 1;
        in_last = i == K + 3;
        systematic = rsc1_sys[soft_at+i];
        parity1 = rsc1_par[soft_at+i];
        parity2 = rsc2_par[soft_at+i];
      end
      @(negedge clk);
      in_valid = 0;
      in_last = 0;
      for (i = 0; i < K; i = i + 1) begin
        while (!out_valid) @(negedge clk);
        decided[dout_at+i] = out_bit;
        if (out_bit !== expected[dout_at+i]) begin
          if (errors == 0)
            $display("block %0d: bit %0d is %b, the model gives %b", b, i, out_bit, expected[dout_at+i]);
          errors = errors + 1;
        end
        @(negedge clk);
      end
    end
    $writememh("simulated.hex", decided);
    if (errors != 0) $fatal(1, "%0d of %0d bits differ", errors, DOUT_WORDS);
    $display("%0d blocks are those of the model", BLOCKS);
    $finish;
  end
endmodule
