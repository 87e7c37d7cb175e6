// SPDX-License-Identifier: MIT
// A stand-in for a decoder: it takes the soft values of a block and shifts out decisions that it was given
// beforehand, one bit a cycle. error_block and error_bit choose a decision that it gets wrong.

module stand_in #(
    parameter int K = 40,
    parameter int BLOCKS = 20
) (
    input  logic              clk,
    input  logic              in_valid,
    input  logic signed [7:0] systematic,
    input  logic signed [7:0] parity1,
    input  logic signed [7:0] parity2,
    input  int                error_block,
    input  int                error_bit,
    output logic              out_valid,
    output logic              out_bit
);

  logic [K-1:0] decided [0:BLOCKS-1];  // first bit leftmost
  logic [K-1:0] shift;
  int position = 0;
  int block = 0;
  int left = 0;

  assign out_valid = left > 0;
  assign out_bit = shift[K-1];

  always_ff @(posedge clk) begin
    if (left > 0) begin
      shift <= shift << 1;
      left <= left - 1;
    end
    if (in_valid) begin
      position <= position == K + 3 ? 0 : position + 1;
      if (position == K + 3) begin
        shift <= decided[block] ^ (block == error_block ? K'(1) << (K - 1 - error_bit) : '0);
        left <= K;
        block <= block + 1;
      end
    end
  end

  // A true decoder would use them.
  wire unused = &{systematic, parity1, parity2};

endmodule
