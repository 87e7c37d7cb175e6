// SPDX-License-Identifier: MIT
// A self-checking test bench: every block that goes into the device goes into the model, and every bit that comes
// out is compared. Plus arguments: +directory=DIR with k40_soft.hex and k40_decided.hex, and +error_block=N
// +error_bit=N to let the device make a mistake. Blocks and bits count from 0.

module bench;
  import quarzel_pkg::*;

  localparam int K = 40;
  localparam int BLOCKS = 20;

  logic clk = 0;
  initial forever #5 clk = !clk;

  logic in_valid = 0;
  logic signed [7:0] systematic, parity1, parity2;
  logic out_valid, out_bit;
  int error_block = -1;
  int error_bit = 0;
  string directory = ".";

  stand_in #(.K(K), .BLOCKS(BLOCKS)) device (.*);

  logic [23:0] stimulus [0:BLOCKS*(K+4)-1];  // systematic, parity 1, parity 2 of a position in a word
  quarzel_decoder model;
  bit expected [$];
  int received = 0;

  initial begin
    void'($value$plusargs("error_block=%d", error_block));
    void'($value$plusargs("error_bit=%d", error_bit));
    void'($value$plusargs("directory=%s", directory));
    $readmemh({directory, "/k40_soft.hex"}, stimulus);
    $readmemh({directory, "/k40_decided.hex"}, device.decided);
    model = new(8);
    for (int block = 0; block < BLOCKS; block++) begin
      for (int i = 0; i < K + 4; i++) begin
        @(negedge clk);
        {systematic, parity1, parity2} = stimulus[block*(K+4)+i];
        in_valid = 1;
        model.push(32'(systematic), 32'(parity1), 32'(parity2));
      end
      if (model.run(6) != K) $fatal(1, "the model refused block %0d", block);
      for (int i = 0; i < K; i++) expected.push_back(model.pop());
    end
    @(negedge clk) in_valid = 0;
    repeat (K + 10) @(negedge clk);
    if (received != BLOCKS * K) $fatal(1, "%0d of %0d bits came out", received, BLOCKS * K);
    model.close();
    $display("%0d blocks of %0d bits are those of the model", BLOCKS, K);
    $finish;
  end

  always @(posedge clk) begin
    if (out_valid) begin
      if (out_bit !== expected[received]) begin
        $fatal(1, "block %0d: bit %0d is %b, the model gives %b", received / K, received % K, out_bit,
               expected[received]);
      end
      received <= received + 1;
    end
  end

endmodule
