/* SPDX-License-Identifier: MIT */
#include "vardel_ip_quarzel.h"

#include <stddef.h>
#include <stdio.h>
#include <string.h>

static int failures = 0;

static void expect(int condition, const char* what) {
    if (!condition) {
        fprintf(stderr, "failed: %s\n", what);
        ++failures;
    }
}

#define EXPECT(condition) expect((condition) != 0, #condition)

static void expect_layout(void) {
    if (sizeof(void*) != 8) {
        return; /* the offsets are those of 64-bit processors */
    }
    EXPECT(sizeof(vardel_ip_quarzel_generics) == 72);
    EXPECT(offsetof(vardel_ip_quarzel_generics, C_PATH) == 0);
    EXPECT(offsetof(vardel_ip_quarzel_generics, C_FAMILY) == 8);
    EXPECT(offsetof(vardel_ip_quarzel_generics, C_COMPONENT_NAME) == 16);
    EXPECT(offsetof(vardel_ip_quarzel_generics, C_SPARE_1) == 24);
    EXPECT(offsetof(vardel_ip_quarzel_generics, C_STATE_INT_WIDTH) == 28);
    EXPECT(offsetof(vardel_ip_quarzel_generics, C_STATE_FRAC_WIDTH) == 32);
    EXPECT(offsetof(vardel_ip_quarzel_generics, C_INPUT_INT_WIDTH) == 36);
    EXPECT(offsetof(vardel_ip_quarzel_generics, C_INPUT_FRAC_WIDTH) == 40);
    EXPECT(offsetof(vardel_ip_quarzel_generics, C_SPARE_2) == 44);
    EXPECT(offsetof(vardel_ip_quarzel_generics, C_SPARE_3) == 48);
    EXPECT(offsetof(vardel_ip_quarzel_generics, C_SPARE_4) == 52);
    EXPECT(offsetof(vardel_ip_quarzel_generics, C_NUM_PU) == 56);
    EXPECT(offsetof(vardel_ip_quarzel_generics, C_TAG_WIDTH) == 60);
    EXPECT(offsetof(vardel_ip_quarzel_generics, C_ALGORITHM_TYPE) == 64);
    EXPECT(sizeof(vardel_ip_quarzel_inputs) == 40);
    EXPECT(offsetof(vardel_ip_quarzel_inputs, rsc1_sys) == 0);
    EXPECT(offsetof(vardel_ip_quarzel_inputs, rsc1_par) == 8);
    EXPECT(offsetof(vardel_ip_quarzel_inputs, rsc2_par) == 16);
    EXPECT(offsetof(vardel_ip_quarzel_inputs, din_size) == 24);
    EXPECT(offsetof(vardel_ip_quarzel_inputs, iterations) == 28);
    EXPECT(offsetof(vardel_ip_quarzel_inputs, tag) == 32);
    EXPECT(sizeof(vardel_ip_quarzel_outputs) == 24);
    EXPECT(offsetof(vardel_ip_quarzel_outputs, dout) == 0);
    EXPECT(offsetof(vardel_ip_quarzel_outputs, dout_alloc_size) == 8);
    EXPECT(offsetof(vardel_ip_quarzel_outputs, dout_size) == 12);
    EXPECT(offsetof(vardel_ip_quarzel_outputs, tag) == 16);
}

int main(void) {
    int soft[44];
    unsigned char bits[40];
    vardel_ip_quarzel_generics generics;
    vardel_ip_quarzel_outputs out;
    vardel_ip_quarzel_inputs in = {soft, soft, soft, 44, 3, 0x1FF};
    vardel_ip_quarzel_state* state;
    const float ratio = -0.625F;
    int8_t quantised = 0;
    int i;

    expect_layout();
    EXPECT(vardel_ip_quarzel_bitacc_quantise_float(&ratio, 1, VARDEL_IP_QUARZEL_LLR_SCALE, &quantised) == 0);
    EXPECT(quantised == -2);
    for (i = 0; i < 44; ++i) {
        soft[i] = -8;
    }
    memset(bits, 0xEE, sizeof bits);
    out.dout = bits;
    out.dout_alloc_size = 40;
    EXPECT(vardel_ip_quarzel_get_default_generics(&generics) == &generics);
    state = create_default_state(generics);
    EXPECT(state != NULL);
    vardel_ip_quarzel_destroy_state(state);
    state = vardel_ip_quarzel_create_state(generics);
    EXPECT(state != NULL);
    vardel_ip_quarzel_bitacc_dump_config(state, 0);
    EXPECT(vardel_ip_quarzel_bitacc_simulate(state, &out, in) == 0);
    EXPECT(out.dout_size == 40);
    EXPECT(out.tag == 0xFF);
    for (i = 0; i < 40; ++i) {
        EXPECT(bits[i] == 0);
    }
    vardel_ip_quarzel_destroy_state(state);
    return failures != 0;
}
