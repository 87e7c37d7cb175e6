/* SPDX-License-Identifier: MIT */
/* Every port of the C interface, from C99. */
#include <stdio.h>
#include <string.h>
#include <vardel_ip_quarzel.h>

static void count_line(void* cookie, int kind, const char* text) {
    if (kind == VARDEL_IP_QUARZEL_ERROR && strstr(text, "C_NUM_PU") != NULL) {
        ++*(int*)cookie;
    }
}

static void count_pass(void* cookie, const vardel_ip_quarzel_pass* pass) {
    if (pass->block_size == 40 && pass->llr[0] < 0) {
        ++*(int*)cookie;
    }
}

int main(void) {
    signed char soft[3 * 44];
    unsigned char bits[40];
    unsigned int permutation[40];
    int lines = 0;
    int passes = 0;
    int status;
    vardel_ip_quarzel_generics generics;
    vardel_ip_quarzel_state* core;
    vardel_ip_quarzel_block_size size;
    vardel_ip_quarzel_layout layout;
    vardel_ip_quarzel_signal signal;
    vardel_ip_quarzel_array_inputs in;
    vardel_ip_quarzel_array_outputs out;

    memset(soft, -8, sizeof soft);
    vardel_ip_quarzel_get_default_generics(&generics);
    generics.C_NUM_PU = 3;
    if (vardel_ip_quarzel_check_generics(&generics) == NULL ||
        vardel_ip_quarzel_create_state_with_messages(&generics, count_line, &lines) != NULL || lines != 1) {
        return 1;
    }
    generics.C_NUM_PU = 4;
    core = vardel_ip_quarzel_create_state_with_messages(&generics, count_line, &lines);
    vardel_ip_quarzel_set_messages(core, NULL, NULL);
    if (vardel_ip_quarzel_set_implementation(core, vardel_ip_quarzel_get_implementation_name(0)) != 0 ||
        strcmp(vardel_ip_quarzel_get_implementation(core), vardel_ip_quarzel_get_implementation_name(0)) !=
            0) {
        return 2;
    }
    vardel_ip_quarzel_set_passes(core, 3, count_pass, &passes);
    in.rsc1_sys = soft;
    in.rsc1_par = soft + 44;
    in.rsc2_par = soft + 88;
    in.block_stride = 132;
    in.position_stride = 1;
    in.value_type = VARDEL_IP_QUARZEL_INT8;
    in.din_size = 44;
    in.count = 1;
    in.iterations = 2;
    in.tags = NULL;
    out.dout = bits;
    out.block_stride = 40;
    out.iteration_stride = 0;
    out.tags = NULL;
    status = vardel_ip_quarzel_bitacc_simulate_array(core, &out, &in, NULL);
    vardel_ip_quarzel_destroy_state(core);
    if (passes != 3 || vardel_ip_quarzel_get_block_size(0, &size) != 0 || size.K != 40 ||
        vardel_ip_quarzel_get_permutation(40, permutation) != 0 || permutation[1] != 13 ||
        vardel_ip_quarzel_get_layout(6144, 8, &layout) != 0 || layout.segments != 32 ||
        vardel_ip_quarzel_get_signal(0, &signal) != 0 || strcmp(signal.name, "int") != 0 ||
        strcmp(vardel_ip_quarzel_version(), VARDEL_IP_QUARZEL_VERSION) != 0) {
        return 3;
    }
    printf("status %d, %u bits, first bit %d, tag %d\n", status, size.K, bits[0], lines);
    return status;
}
