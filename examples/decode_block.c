#include <stdio.h>
#include <vardel_ip_quarzel.h>

int main(void) {
    int soft[44]; /* K = 40 bits and 4 tail positions; positive means bit 1, the unit is 1/8 */
    unsigned char bits[40];
    for (int i = 0; i < 44; ++i) {
        soft[i] = -8; /* -1.0 everywhere: the code word of 40 zeros */
    }
    vardel_ip_quarzel_generics generics;
    vardel_ip_quarzel_state* core =
        vardel_ip_quarzel_create_state(*vardel_ip_quarzel_get_default_generics(&generics));
    vardel_ip_quarzel_outputs out = {bits, 40, 0, 0};
    vardel_ip_quarzel_inputs in = {soft, soft, soft, 44, 6, 1};
    int status = vardel_ip_quarzel_bitacc_simulate(core, &out, in);
    printf("status %d, %d bits, first bit %d, tag %u\n", status, out.dout_size, bits[0], out.tag);
    vardel_ip_quarzel_destroy_state(core);
    return status;
}
