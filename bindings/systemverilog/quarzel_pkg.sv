// SPDX-License-Identifier: MIT
// The model of the turbo decoder core for SystemVerilog, over DPI-C. Link or load libquarzel_dpi.so.
//
// Use the class quarzel_decoder. Soft values are in units of 1/8, POSITIVE MEANS BIT 1. A block of K bits comes
// as three streams of K + 4 values: systematic, parity 1, parity 2, the tail in the last 4 positions.
//
// The imported functions change the model's state: call them, and the class, once a block from procedural code
// (initial, always_ff, tasks, functions of test bench classes), never from a continuous assignment or always_comb,
// which a simulator evaluates as often as it likes.

package quarzel_pkg;

  localparam int QUARZEL_MAX_K = 6144;
  localparam int QUARZEL_MAX_POSITIONS = QUARZEL_MAX_K + 4;

  typedef byte quarzel_stream_t [0:QUARZEL_MAX_POSITIONS-1];
  typedef logic signed [31:0] quarzel_logic_stream_t [0:QUARZEL_MAX_POSITIONS-1];
  typedef bit  quarzel_bits_t   [0:QUARZEL_MAX_K-1];

  // A new model; always a handle, whose error tells whether it can be used.
  import "DPI-C" function chandle quarzel_dpi_open(input int units, input int algorithm, input int tag_width);
  // Free the model. 0, or -1 when it was closed before.
  import "DPI-C" function int quarzel_dpi_close(input chandle handle);
  // What went wrong in the last call with this handle; empty when nothing did.
  import "DPI-C" function string quarzel_dpi_error(input chandle handle);
  // The next warning of the model; empty when there is none.
  import "DPI-C" function string quarzel_dpi_next_warning(input chandle handle);

  // Arrays of a fixed size, of which the first `positions` are used. K, or -1.
  import "DPI-C" function int quarzel_dpi_decode_fixed(
      input chandle handle, input int positions, input quarzel_stream_t systematic,
      input quarzel_stream_t parity1, input quarzel_stream_t parity2, input int iterations,
      input int unsigned tag, output quarzel_bits_t bits);
  // The same for four-valued soft values: an x or z in those that are used is an error, which names the first one.
  import "DPI-C" function int quarzel_dpi_decode_logic(
      input chandle handle, input int positions, input quarzel_logic_stream_t systematic,
      input quarzel_logic_stream_t parity1, input quarzel_logic_stream_t parity2, input int iterations,
      input int unsigned tag, output quarzel_bits_t bits);

  // Open arrays, which carry their sizes. K, or -1. bits needs room for K decisions.
  import "DPI-C" function int quarzel_dpi_decode_open(
      input chandle handle, input byte systematic[], input byte parity1[], input byte parity2[],
      input int iterations, input int unsigned tag, output bit bits[]);

  // Scalars, which every simulator and other languages can pass: push K + 4 positions, run (K, or -1), pop K bits (-1
  // when none is left). An x or z on its way into an int becomes 0: quarzel_dpi_decode_logic and the class find it.
  import "DPI-C" function void quarzel_dpi_push(
      input chandle handle, input int systematic, input int parity1, input int parity2);
  import "DPI-C" function int quarzel_dpi_run(input chandle handle, input int iterations, input int unsigned tag);
  import "DPI-C" function int quarzel_dpi_pop(input chandle handle);

  // The tag of the last decoded block, masked to the tag width.
  import "DPI-C" function int unsigned quarzel_dpi_tag(input chandle handle);
  // Write a trace of the first passes (two an iteration) of the next block to a file. 0, or -1.
  import "DPI-C" function int quarzel_dpi_trace_next(input chandle handle, input int passes, input string file);

  // Push K bits, encode (K + 4 positions, or -1), read the code bits of stream 0 systematic, 1 and 2 parities.
  import "DPI-C" function void quarzel_dpi_push_bit(input chandle handle, input bit value);
  import "DPI-C" function int quarzel_dpi_encode(input chandle handle);
  import "DPI-C" function int quarzel_dpi_code_bit(input chandle handle, input int stream, input int position);


  // A model of one core. Errors are reported by $error and a result of -1 (or a null bit), warnings of the model
  // by $warning.
  class quarzel_decoder;

    protected chandle handle;
    protected quarzel_logic_stream_t pushed_systematic, pushed_parity1, pushed_parity2;
    protected int pushed = 0;  // positions of the next block
    protected quarzel_bits_t decisions;
    protected int decided = 0;  // decisions of the last block
    protected int popped = 0;   // how many of them have been popped

    // units 2, 4 or 8; algorithm 0 max-log, 1 max-log with scaled extrinsic values, 2 max-star.
    function new(int units = 2, int algorithm = 1, int tag_width = 8);
      handle = quarzel_dpi_open(units, algorithm, tag_width);
      report();
    endfunction

    // Decode a block held in arrays of any size: K, or -1. bits is resized to K.
    function int decode(input byte systematic[], input byte parity1[], input byte parity2[],
                        output bit bits[], input int iterations = 6, input int unsigned tag = 0);
      quarzel_stream_t fixed_systematic, fixed_parity1, fixed_parity2;
      if (systematic.size() != parity1.size() || systematic.size() != parity2.size()) begin
        $error("quarzel: the streams have %0d, %0d and %0d values; they must have the same number",
               systematic.size(), parity1.size(), parity2.size());
        return -1;
      end
      for (int i = 0; i < systematic.size() && i < QUARZEL_MAX_POSITIONS; i++) begin
        fixed_systematic[i] = systematic[i];
        fixed_parity1[i] = parity1[i];
        fixed_parity2[i] = parity2[i];
      end
      decode = quarzel_dpi_decode_fixed(handle, systematic.size(), fixed_systematic, fixed_parity1, fixed_parity2,
                                        iterations, tag, decisions);
      report();
      decided = 0;
      popped = 0;
      if (decode > 0) begin
        bits = new[decode];
        for (int i = 0; i < decode; i++) bits[i] = decisions[i];
      end
    endfunction

    // One position of the next block. An x or z in it makes run fail.
    function void push(logic signed [31:0] systematic, logic signed [31:0] parity1, logic signed [31:0] parity2);
      if (pushed < QUARZEL_MAX_POSITIONS) begin
        pushed_systematic[pushed] = systematic;
        pushed_parity1[pushed] = parity1;
        pushed_parity2[pushed] = parity2;
      end
      pushed++;
    endfunction

    // Decode what has been pushed: K, or -1. It is used up, whatever comes of it.
    function int run(int iterations = 6, int unsigned tag = 0);
      run = quarzel_dpi_decode_logic(handle, pushed, pushed_systematic, pushed_parity1, pushed_parity2, iterations,
                                     tag, decisions);
      report();
      pushed = 0;
      decided = run > 0 ? run : 0;
      popped = 0;
    endfunction

    // The next decision of the last block that was pushed.
    function bit pop();
      if (popped >= decided) begin
        $error("quarzel: all decisions of the last block have been popped; run the next one");
        return 0;
      end
      pop = decisions[popped];
      popped++;
    endfunction

    // The tag of the last decoded block, masked to the tag width.
    function int unsigned tag();
      return quarzel_dpi_tag(handle);
    endfunction

    // Write a trace of the first passes (two an iteration) of the next block to a file.
    function void trace_next(int passes, string file);
      void'(quarzel_dpi_trace_next(handle, passes, file));
      report();
    endfunction

    // Encode a block: K + 4, or -1. The streams are resized to K + 4 code bits of 0 and 1.
    function int encode(input bit bits[], output bit systematic[], output bit parity1[], output bit parity2[]);
      for (int i = 0; i < bits.size(); i++) quarzel_dpi_push_bit(handle, bits[i]);
      encode = quarzel_dpi_encode(handle);
      report();
      if (encode > 0) begin
        systematic = new[encode];
        parity1 = new[encode];
        parity2 = new[encode];
        for (int i = 0; i < encode; i++) begin
          systematic[i] = quarzel_dpi_code_bit(handle, 0, i) == 1;
          parity1[i] = quarzel_dpi_code_bit(handle, 1, i) == 1;
          parity2[i] = quarzel_dpi_code_bit(handle, 2, i) == 1;
        end
      end
    endfunction

    // Free the model. Later calls are refused.
    function void close();
      void'(quarzel_dpi_close(handle));
    endfunction

    // Hand the messages of the last call to the simulator.
    protected function void report();
      string text;
      text = quarzel_dpi_next_warning(handle);
      while (text != "") begin
        $warning("quarzel: %s", text);
        text = quarzel_dpi_next_warning(handle);
      end
      text = quarzel_dpi_error(handle);
      if (text != "") $error("quarzel: %s", text);
    endfunction

  endclass

endpackage
