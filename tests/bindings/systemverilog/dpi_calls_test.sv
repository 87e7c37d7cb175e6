// SPDX-License-Identifier: MIT
// Decodes with dynamic, fixed and open arrays and with scalars, the encoder, tags, traces, warnings and refusals. With
// +refused or +too_long it ends with a wrong call of the class, which must stop the simulation.

module dpi_calls_test;
  import quarzel_pkg::*;

  localparam int K = 40;

  quarzel_decoder model;
  chandle handle;
  bit information[], systematic[], parity1[], parity2[], decoded[];
  byte soft0[], soft1[], soft2[], none[];
  byte fixed0[K+4], fixed1[K+4], fixed2[K+4];
  quarzel_stream_t longest0, longest1, longest2;
  quarzel_logic_stream_t logic0, logic1, logic2;
  quarzel_bits_t longest_bits;
  bit fixed_bits[K];
  bit too_few_bits[K-1];
  byte short_stream[K];

  function automatic void check(bit good, string what);
    if (!good) $fatal(1, "failed: %s", what);
    $display("ok: %s", what);
  endfunction

  function automatic byte soft_of(bit value);
    return value ? 8'sd8 : -8'sd8;
  endfunction

  initial begin
    // A round trip through the class.
    information = new[K];
    foreach (information[i]) information[i] = 1'($urandom);
    model = new;
    check(model.encode(information, systematic, parity1, parity2) == K + 4, "encode gives K + 4 positions");
    soft0 = new[K+4];
    soft1 = new[K+4];
    soft2 = new[K+4];
    for (int i = 0; i < K + 4; i++) begin
      soft0[i] = soft_of(systematic[i]);
      soft1[i] = soft_of(parity1[i]);
      soft2[i] = soft_of(parity2[i]);
      fixed0[i] = soft0[i];
      fixed1[i] = soft1[i];
      fixed2[i] = soft2[i];
      longest0[i] = soft0[i];
      longest1[i] = soft1[i];
      longest2[i] = soft2[i];
      logic0[i] = 32'(soft0[i]);
      logic1[i] = 32'(soft1[i]);
      logic2[i] = 32'(soft2[i]);
    end
    check(model.decode(soft0, soft1, soft2, decoded, 6, 32'h107) == K, "the class decodes dynamic arrays");
    check(decoded.size() == K, "the class sizes the bits");
    for (int i = 0; i < K; i++) if (decoded[i] != information[i]) $fatal(1, "bit %0d is wrong", i);
    check(model.tag() == 7, "the tag comes back masked");
    model.trace_next(2, "trace.txt");
    void'(model.decode(soft0, soft1, soft2, decoded));
    model.push(200, 0, 0);
    for (int i = 0; i < K + 3; i++) model.push(0, 0, 0);
    check(model.run() == K, "the class decodes what was pushed");

    // Fixed and open arrays.
    handle = quarzel_dpi_open(8, 2, 8);
    check(quarzel_dpi_error(handle) == "", "a core is made");
    check(quarzel_dpi_decode_open(handle, fixed0, fixed1, fixed2, 3, 9, fixed_bits) == K, "open arrays");
    for (int i = 0; i < K; i++) if (fixed_bits[i] != information[i]) $fatal(1, "bit %0d is wrong", i);
    check(quarzel_dpi_decode_fixed(handle, K + 4, longest0, longest1, longest2, 3, 9, longest_bits) == K,
          "arrays of the greatest size");
    for (int i = 0; i < K; i++) if (longest_bits[i] != information[i]) $fatal(1, "bit %0d is wrong", i);
    check(quarzel_dpi_tag(handle) == 9, "the tag comes back");
    for (int i = 0; i < K; i++) longest_bits[i] = 0;
    check(quarzel_dpi_decode_logic(handle, K + 4, logic0, logic1, logic2, 3, 9, longest_bits) == K,
          "arrays of four-valued integers");
    for (int i = 0; i < K; i++) if (longest_bits[i] != information[i]) $fatal(1, "bit %0d is wrong", i);
    for (int i = 0; i < K + 4; i++) quarzel_dpi_push(handle, int'(soft0[i]), int'(soft1[i]), int'(soft2[i]));
    check(quarzel_dpi_run(handle, 3, 9) == K, "scalars");
    for (int i = 0; i < K; i++)
      if (quarzel_dpi_pop(handle) != int'(information[i])) $fatal(1, "bit %0d is wrong", i);

    // What is refused, with the remedy.
    check(quarzel_dpi_decode_open(handle, fixed0, fixed1, short_stream, 3, 0, fixed_bits) == -1, "other sizes");
    $display("%s", quarzel_dpi_error(handle));
    check(quarzel_dpi_decode_open(handle, fixed0, fixed1, fixed2, 3, 0, too_few_bits) == -1, "no room");
    $display("%s", quarzel_dpi_error(handle));
    check(quarzel_dpi_decode_fixed(handle, 45, longest0, longest1, longest2, 3, 0, longest_bits) == -1, "no size");
    $display("%s", quarzel_dpi_error(handle));
    check(quarzel_dpi_decode_fixed(handle, -1, longest0, longest1, longest2, 3, 0, longest_bits) == -1, "less");
    check(quarzel_dpi_run(handle, 3, 0) == -1, "nothing pushed");
    check(quarzel_dpi_decode_fixed(handle, K + 4, longest0, longest1, longest2, 16, 0, longest_bits) == -1, "16");
    $display("%s", quarzel_dpi_error(handle));
    while (quarzel_dpi_pop(handle) >= 0) begin end
    $display("%s", quarzel_dpi_error(handle));
    check(quarzel_dpi_trace_next(handle, 2, "no/such/directory") == 0, "a trace is asked for");
    check(quarzel_dpi_decode_open(handle, fixed0, fixed1, fixed2, 3, 0, fixed_bits) == -1, "not writable");
    $display("%s", quarzel_dpi_error(handle));
    check(quarzel_dpi_code_bit(handle, 3, 0) == -1, "no such code bit");
    check(quarzel_dpi_close(handle) == 0, "close");
    check(quarzel_dpi_close(handle) == -1, "close again");
    check(quarzel_dpi_run(handle, 3, 0) == -1, "run after close");
    $display("%s", quarzel_dpi_error(handle));
    handle = quarzel_dpi_open(3, 1, 8);
    $display("%s", quarzel_dpi_error(handle));

    if ($test$plusargs("too_long")) begin
      for (int i = 0; i < QUARZEL_MAX_POSITIONS + 1; i++) model.push(0, 0, 0);
      void'(model.run());
    end
    if ($test$plusargs("refused")) void'(model.decode(soft0, soft1, none, decoded));
    model.close();
    $finish;
  end

endmodule
