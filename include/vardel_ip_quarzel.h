/* SPDX-License-Identifier: MIT */
/**
 * quarzel: a bit-accurate model of a hardware turbo decoder core for 3GPP LTE.
 *
 * This header is the manual of the C interface, in the order of use:
 *
 *   1. vardel_ip_quarzel_get_default_generics   fill a record that describes the core
 *   2. vardel_ip_quarzel_create_state           make a model of that core
 *   3. vardel_ip_quarzel_bitacc_simulate        decode one code block; call it as often as needed
 *      vardel_ip_quarzel_bitacc_simulate_batch  decode many code blocks, faster
 *      vardel_ip_quarzel_bitacc_dump_config     (C++ or GNU C) print a trace of the next passes
 *   4. vardel_ip_quarzel_destroy_state          free the model
 *
 * Soft values. A soft value is a signed integer in units of 1/8, so 8 stands for 1.0. Its sign is the
 * decision: POSITIVE MEANS BIT 1, negative means bit 0. The core has 8-bit inputs, -128 to 127; what lies
 * outside is saturated, with one warning in the life of a state. The core neither knows nor needs the noise
 * variance: a log-likelihood ratio ln(P(1)/P(0)) times 8, or any other scale, may be given. Algorithm type 2
 * does best with a log-likelihood ratio times 4.
 *
 * Code blocks. A code block of K information bits (188 sizes from 40 to 6144; 3GPP TS 36.212, Table 5.1.3-3)
 * comes as three streams of K + 4 soft values: systematic, parity of the first constituent code, parity of
 * the second. Positions K to K + 3 hold the twelve tail values as the standard places them (section
 * 5.1.3.2.2); "xT" is a systematic tail value, "zT" a parity tail value, of constituent code 1 or 2 and
 * termination step 0, 1 or 2:
 *
 *   position   rsc1_sys       rsc1_par       rsc2_par
 *   K          xT code 1, 0   zT code 1, 0   xT code 1, 1
 *   K + 1      zT code 1, 1   xT code 1, 2   zT code 1, 2
 *   K + 2      xT code 2, 0   zT code 2, 0   xT code 2, 1
 *   K + 3      zT code 2, 1   xT code 2, 2   zT code 2, 2
 *
 * Messages. Errors are one line on the standard error stream, beginning "ERROR:". Warnings (beginning
 * "WARNING:") and traces go to the standard output stream. Each line is one write, and no formatting flag,
 * locale or exception mask that the program has set on these streams changes it.
 *
 * Threads. The library starts no threads and has no global mutable data. Use a state from one thread at a
 * time; different states are independent.
 */
#ifndef VARDEL_IP_QUARZEL_H
#define VARDEL_IP_QUARZEL_H

#if defined(__GNUC__)
#define VARDEL_IP_QUARZEL_API __attribute__((visibility("default")))
#else
#define VARDEL_IP_QUARZEL_API
#endif

#ifdef __cplusplus
extern "C" {
#endif

/**
 * How the core is configured. 72 bytes on 64-bit Linux. The strings are neither read nor copied nor freed by
 * the model: they may be null and need not outlive the call.
 */
typedef struct vardel_ip_quarzel_generics {
    const char* C_PATH;           /**< a directory path; kept, never read. Default "./" */
    const char* C_FAMILY;         /**< device family; kept, never read. Default "durnox5" */
    const char* C_COMPONENT_NAME; /**< component name; kept, never read. Default "quarzel" */
    int C_SPARE_1;                /**< kept, never read. Default 512 */
    int C_STATE_INT_WIDTH;        /**< integer bits of the state metrics; must be 9 */
    int C_STATE_FRAC_WIDTH;       /**< fractional bits of the state metrics; must be 3 */
    int C_INPUT_INT_WIDTH;        /**< integer bits of the soft inputs; must be 5 */
    int C_INPUT_FRAC_WIDTH;       /**< fractional bits of the soft inputs; must be 3 */
    int C_SPARE_2;                /**< kept, never read. Default 0 */
    int C_SPARE_3;                /**< kept, never read. Default 0 */
    int C_SPARE_4;                /**< kept, never read. Default 0 */
    int C_NUM_PU;                 /**< parallel processing units of the core: 2, 4 or 8. Default 2 */
    int C_TAG_WIDTH;              /**< width of the block tag in bits, 0 to 32. Default 8; at 0 AND at 32
                                       every tag comes back as 0, as it does from the core */
    int C_ALGORITHM_TYPE;         /**< arithmetic of the decoder. Default 1
                                       0: max-log
                                       1: max-log, extrinsic values scaled by 0.75
                                       2: max-star with a 16-point correction table */
} vardel_ip_quarzel_generics;

/** A model of one configured core. Made by create_state, freed by destroy_state. */
typedef struct vardel_ip_quarzel_state vardel_ip_quarzel_state;

/** One code block, as the caller hands it over. 40 bytes on 64-bit Linux. */
typedef struct vardel_ip_quarzel_inputs {
    const int* rsc1_sys; /**< systematic soft values, din_size entries */
    const int* rsc1_par; /**< parity of the first constituent code, din_size entries */
    const int* rsc2_par; /**< parity of the second constituent code, din_size entries */
    int din_size;        /**< entries in each array: K + 4 */
    int iterations;      /**< decoder iterations, 1 to 15; every one of them runs */
    unsigned int tag;    /**< block tag, comes back masked to C_TAG_WIDTH bits */
} vardel_ip_quarzel_inputs;

/** What the core gives back. 24 bytes on 64-bit Linux. Written only when simulate returns 0. */
typedef struct vardel_ip_quarzel_outputs {
    unsigned char* dout; /**< set by the caller: room for K hard decisions, one byte (0 or 1) a bit */
    int dout_alloc_size; /**< set by the caller: bytes available at dout; a negative value is taken as
                              boundless, so do not pass one */
    int dout_size;       /**< set by the model: hard decisions written, K */
    unsigned int tag;    /**< set by the model: the masked tag */
} vardel_ip_quarzel_outputs;

/**
 * Fill a generics record with the defaults.
 *
 * @param generics  the record to fill; not tested for null
 * @return          the same pointer
 */
VARDEL_IP_QUARZEL_API vardel_ip_quarzel_generics* vardel_ip_quarzel_get_default_generics(
    vardel_ip_quarzel_generics* generics);

/**
 * Make a model of the core that the generics describe.
 *
 * @return  a state that the caller frees with vardel_ip_quarzel_destroy_state, or null. Before null one line
 *          goes to the standard error stream; the first generic that does not fit is named, in the order
 *          C_NUM_PU, C_TAG_WIDTH, C_ALGORITHM_TYPE, C_STATE_INT_WIDTH, C_STATE_FRAC_WIDTH,
 *          C_INPUT_INT_WIDTH, C_INPUT_FRAC_WIDTH:
 *
 *   ERROR:decoder:C_NUM_PU must be either 2, 4 or 8
 *   ERROR:decoder:C_TAG_WIDTH must be in range 0 to 32
 *   ERROR:decoder:C_ALGORITHM_TYPE must be in range 0 to 2
 *   ERROR:decoder:C_STATE_INT_WIDTH must be 9            (and so on for the other widths)
 *   ERROR:decoder:Could not allocate memory for decoder state
 */
VARDEL_IP_QUARZEL_API vardel_ip_quarzel_state* vardel_ip_quarzel_create_state(
    vardel_ip_quarzel_generics generics);

/**
 * Decode one code block.
 *
 * @param state    the model
 * @param outputs  dout and dout_alloc_size set by the caller; left untouched unless 0 is returned
 * @param inputs   the block; the arrays are only read
 * @return  0   decoded, outputs filled
 *          1   an argument is wrong or dout is too small; a line on the standard error stream says which:
 *
 *   ERROR:decoder:Simulate called with null state structure
 *   ERROR:decoder:Simulate called with null output structure
 *   ERROR:decoder:Simulate called with null pointer for dout
 *   ERROR:decoder:din_size must be a positive integer
 *   ERROR:decoder:rsc1_sys must not be a null pointer    (likewise rsc1_par, rsc2_par)
 *   ERROR:decoder:Number of iterations must be in the range 1 to 15
 *   ERROR:decoder:Insufficient allocated space for output array
 *
 *          2   the decoder refused the block (din_size is not K + 4 for a K of the interleaver); the
 *              decoder has said why on the standard error stream. The state is good for the next block
 *         99   an exception escaped the decoder (out of memory); the state is good for the next block
 *
 * Twice in the life of a state at most, a warning goes to the standard output stream: at the first soft value
 * that is saturated and at the first tag that is truncated.
 */
VARDEL_IP_QUARZEL_API int vardel_ip_quarzel_bitacc_simulate(vardel_ip_quarzel_state* state,
                                                            vardel_ip_quarzel_outputs* outputs,
                                                            vardel_ip_quarzel_inputs inputs);

/**
 * Decode many code blocks: the effect of `count` calls of vardel_ip_quarzel_bitacc_simulate in their order,
 * to the last bit, status, message and warning. Blocks of equal length and iterations are decoded together,
 * however they are mixed, which is faster than a call for each. A failing block spoils no other.
 *
 * @param state     the model
 * @param outputs   `count` records, each as for simulate
 * @param inputs    `count` records, each as for simulate
 * @param count     blocks, 0 or more
 * @param statuses  receives the `count` statuses; may be null
 * @return          the first status that is not 0, or 0. Also 1, with nothing done, after one of
 *
 *   ERROR:decoder:Simulate batch called with null state structure
 *   ERROR:decoder:count must not be negative
 *   ERROR:decoder:Simulate batch called with null output structures
 *   ERROR:decoder:Simulate batch called with null input structures
 */
VARDEL_IP_QUARZEL_API int vardel_ip_quarzel_bitacc_simulate_batch(vardel_ip_quarzel_state* state,
                                                                  vardel_ip_quarzel_outputs* outputs,
                                                                  const vardel_ip_quarzel_inputs* inputs,
                                                                  int count, int* statuses);

/** Free a model and all it owns. Null is allowed and does nothing. */
VARDEL_IP_QUARZEL_API void vardel_ip_quarzel_destroy_state(vardel_ip_quarzel_state* state);

#ifdef __cplusplus
}
#endif

/*
 * The two functions below carry C++ linkage names in the library. GNU C reaches them through the label; a
 * compiler that knows neither C++ nor labels can use everything above.
 */
#if defined(__cplusplus)
#define VARDEL_IP_QUARZEL_LABEL(symbol)
#elif defined(__GNUC__)
#define VARDEL_IP_QUARZEL_LABEL(symbol) __asm__(symbol)
#endif

#if defined(VARDEL_IP_QUARZEL_LABEL)

/**
 * Print a full trace of the next passes to the standard output stream: each block's soft inputs, and after
 * each pass (two an iteration) a table with a row for every trellis step.
 *
 * @param state  the model; not tested for null
 * @param count  passes to print, counted on across blocks; 0 turns the trace off. Decoding goes on after the
 *               last one
 */
VARDEL_IP_QUARZEL_API void vardel_ip_quarzel_bitacc_dump_config(vardel_ip_quarzel_state* state,
                                                                unsigned int count)
    VARDEL_IP_QUARZEL_LABEL("_Z36vardel_ip_quarzel_bitacc_dump_configP23vardel_ip_quarzel_statej");

/**
 * Make a state record without components, for vardel_ip_quarzel_create_state to fill. It validates nothing
 * and cannot decode; free it with vardel_ip_quarzel_destroy_state.
 *
 * @return  the record, or null after "ERROR:decoder:Could not allocate memory for decoder state"
 */
VARDEL_IP_QUARZEL_API vardel_ip_quarzel_state* create_default_state(vardel_ip_quarzel_generics generics)
    VARDEL_IP_QUARZEL_LABEL("_Z20create_default_state26vardel_ip_quarzel_generics");

#undef VARDEL_IP_QUARZEL_LABEL
#endif

#endif
