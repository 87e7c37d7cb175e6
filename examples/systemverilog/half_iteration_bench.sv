// SPDX-License-Identifier: MIT
// Runs half_iteration.sv on the first block of a set of `quarzel vectors` of blocks of 40 bits, writes its internal values
// to simulation.csv for `quarzel trace-diff`, and compares the decisions. Compile with the directory of the core as the
// macro VECTORS and on the include path.

module half_iteration_bench;
  `include "config.vh"
  localparam K = 40;

  reg [7:0] rsc1_sys [0:SOFT_WORDS-1];
  reg [7:0] rsc1_par [0:SOFT_WORDS-1];
  reg [7:0] rsc2_par [0:SOFT_WORDS-1];
  reg       expected [0:DOUT_WORDS-1];

  reg clk = 0;
  always #5 clk = !clk;

  reg start = 0;
  wire forward, backward;
  wire signed [31:0] step;
  wire [95:0] alpha, beta;
  wire [47:0] gamma;
  wire signed [11:0] llr;
  half_iteration #(.K(K)) device (
      .clk(clk), .start(start), .forward(forward), .backward(backward), .step(step), .alpha_values(alpha),
      .beta_values(beta), .gamma_values(gamma), .llr(llr));

  integer file;
  trace_writer #(.SIGNAL("a")) write_alpha (clk, forward, file, 0, 0, step, alpha);
  trace_writer #(.SIGNAL("g"), .COUNT(4), .FIRST(4)) write_gamma (clk, forward, file, 0, 0, step, gamma);
  trace_writer #(.SIGNAL("b")) write_beta (clk, backward, file, 0, 0, step, beta);
  trace_writer #(.SIGNAL("llr"), .COUNT(1)) write_llr (clk, backward, file, 0, 0, step, llr);

  integer i, errors, position;

  // A decision of interleaved order belongs to a natural position.
  always @(negedge clk) begin
    if (backward) begin
      position = (3 * step + 10 * step * step) % K;
      if ((llr >= 0) !== expected[position]) begin
        if (errors == 0) $display("bit %0d is %b, the model gives %b", position, llr >= 0, expected[position]);
        errors = errors + 1;
      end
    end
  end

  initial begin
    errors = 0;
    file = $fopen("simulation.csv", "w");
    $fdisplay(file, "block,pass,step,signal,state,raw");
    $readmemh({`VECTORS, "/rsc1_sys.hex"}, rsc1_sys);
    $readmemh({`VECTORS, "/rsc1_par.hex"}, rsc1_par);
    $readmemh({`VECTORS, "/rsc2_par.hex"}, rsc2_par);
    $readmemh({`VECTORS, "/dout.hex"}, expected);
    for (i = 0; i < K + 4; i = i + 1) begin
      device.rsc1_sys[i] = rsc1_sys[i];
      device.rsc1_par[i] = rsc1_par[i];
      device.rsc2_par[i] = rsc2_par[i];
    end
    @(negedge clk) start = 1;
    @(negedge clk) start = 0;
    while (!backward) @(negedge clk);
    while (backward) @(negedge clk);
    $fclose(file);
    if (errors != 0) $fatal(1, "%0d of %0d bits differ", errors, K);
    $display("all bits are those of the model");
    $finish;
  end
endmodule
