// SPDX-License-Identifier: MIT
// A model of the first half iteration of a block at register level, to show how a fault is found: it has one. Max-log,
// a block of one segment and one window. It forms the branch metrics and runs the forward recursion, a step a cycle, and
// then the backward recursion down from the last step, with the log-likelihood ratios.

// Add, compare, select. Metrics wrap around, so that the sign of their difference tells the larger one.
module add_compare_select #(
    parameter W = 12
) (
    input  signed [W-1:0] metric1,  // at the other end of the branch of bit 1, which adds g
    input  signed [W-1:0] metric0,  // of bit 0
    input  signed [W-1:0] g,
    output signed [W-1:0] larger
);
  wire signed [W-1:0] plus = metric1 + g;
  wire signed [W-1:0] minus = metric0 - g;
  wire signed [W-1:0] difference = plus - minus;
  assign larger = difference < 0 ? minus : plus;
endmodule


module half_iteration #(
    parameter K = 40,
    parameter F1 = 3,
    parameter F2 = 10,
    parameter W = 12
) (
    input                     clk,
    input                     start,
    output reg                forward,   // alpha and gamma are those of the step
    output reg                backward,  // beta and llr are
    output reg signed [31:0]  step,
    output        [8*W-1:0]   alpha_values,
    output        [8*W-1:0]   beta_values,
    output        [4*W-1:0]   gamma_values,
    output signed [W-1:0]     llr
);
  // Soft values as the core gets them, for the bench to fill: K positions and the tail.
  reg signed [7:0] rsc1_sys [0:K+3];
  reg signed [7:0] rsc1_par [0:K+3];
  reg signed [7:0] rsc2_par [0:K+3];

  // State 0 to 7 before and after the branch of bit 1; that of bit 0 leads to the other one of a pair, 4 apart.
  function [2:0] target1(input [2:0] state);
    case (state)
      0: target1 = 4;
      1: target1 = 0;
      2: target1 = 1;
      3: target1 = 5;
      4: target1 = 6;
      5: target1 = 2;
      6: target1 = 3;
      default: target1 = 7;
    endcase
  endfunction

  function [2:0] source1(input [2:0] state);
    case (state)
      4: source1 = 0;
      0: source1 = 1;
      1: source1 = 2;
      5: source1 = 3;
      6: source1 = 4;
      2: source1 = 5;
      3: source1 = 6;
      default: source1 = 7;
    endcase
  endfunction

  function signed [W-1:0] clamped(input integer value);
    clamped = value > 127 ? 127 : value < -128 ? -128 : value;
  endfunction

  reg signed [W-1:0] alpha [0:7];
  reg signed [W-1:0] beta [0:7];
  reg signed [W-1:0] alpha_memory [0:8*K-1];

  // Constituent code 2: systematic values in interleaved order, and the second parity.
  wire signed [31:0] position = (F1 * step + F2 * step * step) % K;
  wire signed [W-1:0] x = rsc1_sys[position];
  wire signed [W-1:0] p = rsc2_par[step];
  wire signed [W-1:0] gamma [4:7];
  assign gamma[4] = clamped(x - p);
  assign gamma[5] = clamped(x - p);
  assign gamma[6] = clamped(x + p);
  assign gamma[7] = clamped(x + p);

  wire signed [W-1:0] next_alpha [0:7];
  wire signed [W-1:0] next_beta [0:7];

  genvar s;
  generate
    for (s = 0; s < 8; s = s + 1) begin : states
      // The branch metric of the states 0 and 1 is g7, of 2 and 3 g5, of 4 and 5 g4, of 6 and 7 g6.
      localparam integer FROM = source1(s);
      localparam integer FORWARD_METRIC = FROM < 2 ? 7 : FROM < 4 ? 5 : FROM < 6 ? 4 : 6;
      localparam integer BACKWARD_METRIC = s < 2 ? 7 : s < 4 ? 5 : s < 6 ? 6 : 4;
      add_compare_select #(.W(W)) forward_acs (
          .metric1(alpha[FROM]), .metric0(alpha[source1(s ^ 4)]), .g(gamma[FORWARD_METRIC]),
          .larger(next_alpha[s]));
      add_compare_select #(.W(W)) backward_acs (
          .metric1(beta[target1(s)]), .metric0(beta[target1(s) ^ 4]), .g(gamma[BACKWARD_METRIC]),
          .larger(next_beta[s]));
      assign alpha_values[W*s+:W] = alpha[s];
      assign beta_values[W*s+:W] = beta[s];
    end
    for (s = 4; s < 8; s = s + 1) begin : branch_metrics
      assign gamma_values[W*(s-4)+:W] = gamma[s];
    end
  endgenerate

  // The ratio: the best path of bit 1 less the best one of bit 0, of alpha before the step and beta after it.
  function signed [W-1:0] larger(input signed [W-1:0] first, input signed [W-1:0] second);
    reg signed [W-1:0] difference;
    begin
      difference = first - second;
      larger = difference < 0 ? second : first;
    end
  endfunction

  wire signed [W-1:0] path1 [0:3];
  wire signed [W-1:0] path0 [0:3];
  generate
    for (s = 0; s < 4; s = s + 1) begin : pairs
      localparam integer METRIC = s == 0 ? 7 : s == 1 ? 5 : s == 2 ? 4 : 6;
      wire signed [W-1:0] even = alpha_memory[8*step+2*s];
      wire signed [W-1:0] odd = alpha_memory[8*step+2*s+1];
      wire signed [W-1:0] odd1 = odd + beta[target1(2*s+1)];
      wire signed [W-1:0] even1 = even + beta[target1(2*s)];
      wire signed [W-1:0] odd0 = odd + beta[target1(2*s+1) ^ 4];
      wire signed [W-1:0] even0 = even + beta[target1(2*s) ^ 4];
      assign path1[s] = larger(odd1, even1) + gamma[METRIC];
      assign path0[s] = larger(odd0, even0) - gamma[METRIC];
    end
  endgenerate
  assign llr = larger(larger(path1[0], path1[1]), larger(path1[2], path1[3])) -
               larger(larger(path0[0], path0[1]), larger(path0[2], path0[3]));

  // The backward metrics before the termination: the soft values along the three steps from each state to state 0,
  // without their low bits.
  task start_backward;
    integer state, metric, i, now, parity, feedback;
    integer tail_x [0:2];
    integer tail_z [0:2];
    begin
      tail_x[0] = rsc1_sys[K+2];
      tail_z[0] = rsc1_par[K+2];
      tail_x[1] = rsc2_par[K+2];
      tail_z[1] = rsc1_sys[K+3];
      tail_x[2] = rsc1_par[K+3];
      tail_z[2] = rsc2_par[K+3];
      for (state = 0; state < 8; state = state + 1) begin
        now = state;
        metric = 0;
        for (i = 0; i < 3; i = i + 1) begin
          // The delay elements are the bits of the state, the first one highest.
          feedback = ((now >> 1) ^ now) & 1;
          parity = ((now >> 2) ^ now) & 1;
          metric = metric + (feedback ? tail_x[i] : -tail_x[i]) + (parity ? tail_z[i] : -tail_z[i]);
          now = now >> 1;
        end
        beta[state] = metric & -8;
      end
    end
  endtask

  integer i;
  initial begin
    forward = 0;
    backward = 0;
  end

  always @(posedge clk) begin
    if (start) begin
      step <= 0;
      forward <= 1;
      for (i = 0; i < 8; i = i + 1) alpha[i] <= i == 0 ? 0 : -1024;
    end else if (forward) begin
      for (i = 0; i < 8; i = i + 1) begin
        alpha_memory[8*step+i] <= alpha[i];
        alpha[i] <= next_alpha[i];
      end
      step <= step + 1;
      if (step == K - 1) begin
        forward <= 0;
        backward <= 1;
        step <= K - 1;
        start_backward;
      end
    end else if (backward) begin
      for (i = 0; i < 8; i = i + 1) beta[i] <= next_beta[i];
      step <= step - 1;
      backward <= step != 0;
    end
  end
endmodule
