// SPDX-License-Identifier: MIT
// Stand-ins for the macros of UVM that quarzel_uvm_pkg uses.
`ifndef QUARZEL_UVM_MACROS
`define QUARZEL_UVM_MACROS

// The factory, without overrides: a class is the maker of its objects itself.
`define uvm_object_utils(T) \
  typedef T type_id; \
  static function T create(string name); \
    T made = new(name); \
    return made; \
  endfunction

// Each component knows nobody, which is null: see verilator_test.sh.
`define uvm_component_utils(T) \
  protected uvm_component nobody;

`define uvm_info(ID, TEXT, VERBOSITY) $display("UVM_INFO [%s] %s", ID, TEXT);
`define uvm_error(ID, TEXT) $display("UVM_ERROR [%s] %s", ID, TEXT);
`define uvm_fatal(ID, TEXT) $fatal(1, "UVM_FATAL [%s] %s", ID, TEXT);

// What writes to the port calls the function of that name of the component that has it. Defaults that are classes, and the
// detour over a queue, are for Verilator 5.006.
`define uvm_analysis_imp_decl(SUFFIX) \
  class uvm_default_imp``SUFFIX; \
    function void write``SUFFIX(uvm_sequence_item block); \
    endfunction \
  endclass \
  class uvm_analysis_imp``SUFFIX #(type T = uvm_sequence_item, type IMP = uvm_default_imp``SUFFIX) extends uvm_port_base; \
    protected IMP implementation; \
    protected T blocks[$]; \
    function new(string name, IMP parent); \
      super.new(name); \
      implementation = parent; \
    endfunction \
    virtual function void take(uvm_object block); \
      T taken; \
      if ($cast(taken, block) == 0) $fatal(1, "a port got a block of another class"); \
      blocks.push_back(taken); \
      implementation.write``SUFFIX(blocks.pop_front()); \
    endfunction \
  endclass

`endif
