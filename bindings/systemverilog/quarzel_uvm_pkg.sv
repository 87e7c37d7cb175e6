// SPDX-License-Identifier: MIT
// NOT RUN WITH UVM. No UVM library was at hand: these classes were run with a stand-in for the few classes and macros of
// UVM that they use (tests/bindings/systemverilog/uvm).
//
// A reference model and a scoreboard for a UVM environment, over quarzel_pkg. Connect the analysis port of the monitor at
// the device's input to `inputs` of the model, its `outputs` to `expected` of the scoreboard, and the analysis port of
// the monitor at the device's output to `actual`. Blocks and bits count from 0.

`include "uvm_macros.svh"

package quarzel_uvm_pkg;
  import uvm_pkg::*;
  import quarzel_pkg::*;

  // A block that goes into the device.
  class quarzel_soft_block extends uvm_sequence_item;
    `uvm_object_utils(quarzel_soft_block)
    logic signed [7:0] systematic[], parity1[], parity2[];  // K + 4 each, units of 1/8, positive means bit 1
    int unsigned iterations = 6;
    int unsigned tag;

    function new(string name = "quarzel_soft_block");
      super.new(name);
    endfunction
  endclass

  // A block that has come out.
  class quarzel_hard_block extends uvm_sequence_item;
    `uvm_object_utils(quarzel_hard_block)
    logic bits[];  // K, four-valued: an x is a difference
    int unsigned tag;

    function new(string name = "quarzel_hard_block");
      super.new(name);
    endfunction
  endclass


  // Decodes each block that comes in at `inputs` and hands it on at `outputs`, in no simulation time. The core is set by
  // the ints "units", "algorithm" and "tag_width" of the configuration database. The block "trace_block" is traced in
  // full to "trace_file".
  class quarzel_reference_model extends uvm_component;
    `uvm_component_utils(quarzel_reference_model)

    uvm_analysis_imp #(quarzel_soft_block, quarzel_reference_model) inputs;
    uvm_analysis_port #(quarzel_hard_block) outputs;

    protected quarzel_decoder model;
    protected int blocks = 0;
    protected int trace_block;
    protected string trace_file;

    function new(string name, uvm_component parent);
      super.new(name, parent);
      inputs = new("inputs", this);
      outputs = new("outputs", this);
    endfunction

    virtual function void build_phase(uvm_phase phase);
      super.build_phase(phase);
      model = new(setting("units", 2), setting("algorithm", 1), setting("tag_width", 8));
      trace_block = setting("trace_block", -1);
      if (!uvm_config_db#(string)::get(this, "", "trace_file", trace_file)) trace_file = "model.txt";
    endfunction

    // A number of the configuration database, or another where it has none of that name.
    protected function int setting(string name, int otherwise);
      int value;
      return uvm_config_db#(int)::get(this, "", name, value) ? value : otherwise;
    endfunction

    virtual function void write(quarzel_soft_block block);
      quarzel_hard_block hard;
      int K;
      if (block.parity1.size() != block.systematic.size() || block.parity2.size() != block.systematic.size())
        `uvm_fatal("MODEL", $sformatf("the streams of block %0d have different sizes", blocks))
      foreach (block.systematic[i])
        model.push(32'(block.systematic[i]), 32'(block.parity1[i]), 32'(block.parity2[i]));
      if (blocks == trace_block) model.trace_next(2 * int'(block.iterations), trace_file);
      K = model.run(block.iterations, block.tag);
      if (K < 0) `uvm_fatal("MODEL", $sformatf("the model refuses block %0d; the line above says why", blocks))
      hard = quarzel_hard_block::type_id::create("hard");
      hard.bits = new[K];
      foreach (hard.bits[i]) hard.bits[i] = model.pop();
      hard.tag = model.tag();
      blocks++;
      outputs.write(hard);
    endfunction

    virtual function void final_phase(uvm_phase phase);
      super.final_phase(phase);
      model.close();
    endfunction
  endclass


  `uvm_analysis_imp_decl(_expected)
  `uvm_analysis_imp_decl(_actual)

  // Compares what comes out of the device with what the model gives. Blocks come out in the order in which they went in.
  class quarzel_scoreboard extends uvm_scoreboard;
    `uvm_component_utils(quarzel_scoreboard)

    uvm_analysis_imp_expected #(quarzel_hard_block, quarzel_scoreboard) expected;
    uvm_analysis_imp_actual #(quarzel_hard_block, quarzel_scoreboard) actual;

    protected quarzel_hard_block waiting[$];  // expected and not come out yet
    protected int blocks = 0;
    protected int wrong = 0;

    function new(string name, uvm_component parent);
      super.new(name, parent);
      expected = new("expected", this);
      actual = new("actual", this);
    endfunction

    virtual function void write_expected(quarzel_hard_block block);
      waiting.push_back(block);
    endfunction

    virtual function void write_actual(quarzel_hard_block block);
      quarzel_hard_block right;
      if (waiting.size() == 0) begin
        `uvm_error("ORDER", $sformatf("block %0d came out, but none has gone in for it", blocks))
        return;
      end
      right = waiting.pop_front();
      if (!equals(block, right)) wrong++;
      blocks++;
    endfunction

    // Whether two blocks are equal; the first difference is reported.
    protected function bit equals(quarzel_hard_block block, quarzel_hard_block right);
      if (block.bits.size() != right.bits.size()) begin
        `uvm_error("SIZE", $sformatf("block %0d has %0d bits, the model gives %0d", blocks, block.bits.size(),
                                     right.bits.size()))
        return 0;
      end
      foreach (right.bits[i])
        if (block.bits[i] !== right.bits[i]) begin
          `uvm_error("BITS", $sformatf("block %0d: bit %0d is %b, the model gives %b", blocks, i, block.bits[i],
                                       right.bits[i]))
          return 0;
        end
      if (block.tag != right.tag) begin
        `uvm_error("TAG", $sformatf("block %0d: the tag is %0d, the model gives %0d", blocks, block.tag, right.tag))
        return 0;
      end
      return 1;
    endfunction

    virtual function void check_phase(uvm_phase phase);
      super.check_phase(phase);
      if (waiting.size() != 0) `uvm_error("LEFT", $sformatf("%0d blocks have not come out", waiting.size()))
      if (blocks == 0) `uvm_error("NONE", "no block has come out")
    endfunction

    virtual function void report_phase(uvm_phase phase);
      super.report_phase(phase);
      `uvm_info("BLOCKS", $sformatf("%0d of %0d blocks are those of the model", blocks - wrong, blocks), UVM_LOW)
    endfunction
  endclass

endpackage
