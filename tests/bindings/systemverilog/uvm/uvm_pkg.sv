// SPDX-License-Identifier: MIT
// Stand-ins for the classes of UVM that quarzel_uvm_pkg uses, just enough to run it without a UVM library.
`include "uvm_macros.svh"

package uvm_pkg;

  localparam int UVM_LOW = 100;

  class uvm_object;
    protected string object_name;

    function new(string name = "");
      object_name = name;
    endfunction
  endclass

  class uvm_sequence_item extends uvm_object;
    function new(string name = "");
      super.new(name);
    endfunction
  endclass

  class uvm_phase;
  endclass

  class uvm_component extends uvm_object;
    function new(string name, uvm_component parent);
      super.new(name);
    endfunction

    virtual function void build_phase(uvm_phase phase);
    endfunction

    virtual function void check_phase(uvm_phase phase);
    endfunction

    virtual function void report_phase(uvm_phase phase);
    endfunction

    virtual function void final_phase(uvm_phase phase);
    endfunction
  endclass

  class uvm_scoreboard extends uvm_component;
    function new(string name, uvm_component parent);
      super.new(name, parent);
    endfunction
  endclass

  // One database for all components.
  class uvm_config_db #(type T = int);
    static T values[string];

    static function void set(uvm_component parent, string path, string name, T value);
      values[name] = value;
    endfunction

    static function bit get(uvm_component parent, string path, string name, inout T value);
      if (values.exists(name) == 0) return 1'b0;
      value = values[name];
      return 1;
    endfunction
  endclass

  // What a port can be connected to.
  class uvm_port_base extends uvm_object;
    function new(string name);
      super.new(name);
    endfunction

    virtual function void take(uvm_object block);
    endfunction
  endclass

  class uvm_analysis_port #(type T = uvm_object) extends uvm_port_base;
    protected uvm_port_base connected[$];
    protected T blocks[$];

    function new(string name, uvm_component parent);
      super.new(name);
    endfunction

    function void connect(uvm_port_base port);
      connected.push_back(port);
    endfunction

    function void write(T block);
      uvm_object taken;
      blocks.push_back(block);
      taken = blocks.pop_front();
      foreach (connected[i]) connected[i].take(taken);
    endfunction
  endclass

  `uvm_analysis_imp_decl()

endpackage
