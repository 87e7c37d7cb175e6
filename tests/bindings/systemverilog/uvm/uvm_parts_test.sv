// SPDX-License-Identifier: MIT
// The reference model and the scoreboard of quarzel_uvm_pkg, with stand-ins for the classes of UVM. Of five blocks the
// second has a wrong bit, the third a wrong tag, the fourth too few bits, and the fifth does not come out. With +early a
// block comes out before one has gone in, with +refused the model gets a block that no core takes.

module uvm_parts_test;
  import uvm_pkg::*;
  import quarzel_pkg::*;
  import quarzel_uvm_pkg::*;

  localparam int K = 40;

  quarzel_decoder encoder;
  quarzel_reference_model model;
  quarzel_scoreboard scoreboard;
  uvm_analysis_port #(quarzel_soft_block) inputs;
  uvm_analysis_port #(quarzel_hard_block) outputs;
  // Arguments of the base class: Verilator 5.006 converts none.
  uvm_component nobody;  // null
  uvm_port_base model_inputs, expected, actual;
  uvm_phase phase;
  bit information[], systematic[], parity1[], parity2[];

  function automatic logic signed [7:0] soft_of(bit value);
    return value ? 8'sd8 : -8'sd8;
  endfunction

  // A block as the monitor at the device's input sees it.
  function automatic quarzel_soft_block soft_block(int tag);
    quarzel_soft_block block = new("soft");
    block.systematic = new[K+4];
    block.parity1 = new[K+4];
    block.parity2 = new[K+4];
    for (int i = 0; i < K + 4; i++) begin
      block.systematic[i] = soft_of(systematic[i]);
      block.parity1[i] = soft_of(parity1[i]);
      block.parity2[i] = soft_of(parity2[i]);
    end
    block.tag = tag;
    return block;
  endfunction

  // The same block at its output, with K bits of which one may be wrong.
  function automatic quarzel_hard_block hard_block(int size, int tag, int wrong_bit);
    quarzel_hard_block block = new("hard");
    block.bits = new[size];
    foreach (block.bits[i]) block.bits[i] = information[i] ^ (i == wrong_bit);
    block.tag = tag;
    return block;
  endfunction

  initial begin
    encoder = new;
    information = new[K];
    foreach (information[i]) information[i] = i % 3 == 0;
    void'(encoder.encode(information, systematic, parity1, parity2));

    uvm_config_db#(int)::set(nobody, "*", "units", 8);
    uvm_config_db#(int)::set(nobody, "*", "trace_block", 1);
    uvm_config_db#(string)::set(nobody, "*", "trace_file", "traced_by_model.txt");
    phase = new;
    model = new("model", nobody);
    scoreboard = new("scoreboard", nobody);
    inputs = new("inputs", nobody);
    outputs = new("outputs", nobody);
    model_inputs = model.inputs;
    expected = scoreboard.expected;
    actual = scoreboard.actual;
    inputs.connect(model_inputs);
    model.outputs.connect(expected);
    outputs.connect(actual);
    model.build_phase(phase);
    scoreboard.build_phase(phase);

    if ($test$plusargs("early")) outputs.write(hard_block(K, 0, -1));
    if ($test$plusargs("refused")) begin
      quarzel_soft_block unknown = soft_block(0);
      unknown.parity1 = new[K];
      inputs.write(unknown);
    end
    for (int block = 0; block < 5; block++) inputs.write(soft_block(block));
    outputs.write(hard_block(K, 0, -1));
    outputs.write(hard_block(K, 1, 17));
    outputs.write(hard_block(K, 9, -1));
    outputs.write(hard_block(K - 1, 3, -1));
    scoreboard.check_phase(phase);
    scoreboard.report_phase(phase);
    model.final_phase(phase);
    encoder.close();
    $finish;
  end

endmodule
