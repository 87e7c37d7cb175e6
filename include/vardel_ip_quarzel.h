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
 *      vardel_ip_quarzel_bitacc_simulate_array  decode the blocks of one array of integers
 *      vardel_ip_quarzel_bitacc_quantise        make soft values of real numbers first
 *      vardel_ip_quarzel_bitacc_dump_config     (C++ or GNU C) print a trace of the next passes
 *   4. vardel_ip_quarzel_destroy_state          free the model
 *
 * Programs that stand round a model ask it for what they need:
 *
 *   messages        what is wrong with generics, and a receiver for every line that a model writes
 *   passes          every signal of the next passes, as arrays of integers
 *   implementation  which decoder is at work, and the choice of another
 *   code            block sizes, permutation, segments and windows, names of the signals, trellis,
 * corrections
 *
 * C++ programs find all of it in quarzel/core.hpp, a class over this header.
 *
 * Soft values. A soft value is a signed integer in units of 1/8, so 8 stands for 1.0. Its sign is the
 * decision: POSITIVE MEANS BIT 1, negative means bit 0. The core has 8-bit inputs, -128 to 127; what lies
 * outside is saturated, with one warning in the life of a state. The core neither knows nor needs the noise
 * variance, but it decodes best at one scale: a log-likelihood ratio ln(P(1)/P(0)) times 4, as
 * vardel_ip_quarzel_bitacc_quantise makes it. With larger soft values the metrics clip, with smaller ones
 * rounding costs, and the correction table of algorithm type 2 stands for this scale.
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
 * locale or exception mask that the program has set on these streams changes it. A receiver takes the place
 * of both streams (see "Messages" below).
 *
 * Threads. The library starts no threads and has no global mutable data. Use a state from one thread at a
 * time; different states are independent. They share the standard streams, though: after a program has called
 * std::ios::sync_with_stdio(false), threads whose states write to these at the same time race there. Take the
 * messages with a receiver then.
 */
#ifndef VARDEL_IP_QUARZEL_H
#define VARDEL_IP_QUARZEL_H

#if defined(__GNUC__)
#define VARDEL_IP_QUARZEL_API __attribute__((visibility("default")))
#else
#define VARDEL_IP_QUARZEL_API
#endif

#include <stddef.h>
#include <stdint.h>

/** The version of this header: major, minor and patch number. */
#define VARDEL_IP_QUARZEL_VERSION "1.1.0"

#ifdef __cplusplus
extern "C" {
#endif

/** The version of the library, as in VARDEL_IP_QUARZEL_VERSION. */
VARDEL_IP_QUARZEL_API const char* vardel_ip_quarzel_version(void);

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
 * What the call writes must not overlap what it writes or reads for any block: the arrays of decisions, the
 * records and the statuses must lie apart from one another and from all soft values.
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

/** How the soft values of an array are held: the bytes of a signed integer. */
enum { VARDEL_IP_QUARZEL_INT8 = 1, VARDEL_IP_QUARZEL_INT16 = 2, VARDEL_IP_QUARZEL_INT32 = 4 };

/**
 * Code blocks of one size, as the caller holds them in one array or in one for each stream. All strides are
 * counted in values and may be negative. The value of position p of block b is at
 * b * block_stride + p * position_stride. A position stride of 1 is the fastest.
 */
typedef struct vardel_ip_quarzel_array_inputs {
    const void* rsc1_sys;      /**< systematic value of position 0 of block 0 */
    const void* rsc1_par;      /**< the same of the parity of the first constituent code */
    const void* rsc2_par;      /**< the same of the parity of the second constituent code */
    ptrdiff_t block_stride;    /**< from a block to the next one, in each stream */
    ptrdiff_t position_stride; /**< from a position to the next one, in each stream */
    int value_type;            /**< VARDEL_IP_QUARZEL_INT8, _INT16 or _INT32 */
    int din_size;              /**< positions of a block: K + 4 */
    int count;                 /**< blocks, 0 or more */
    int iterations;            /**< decoder iterations of every block, 1 to 15 */
    const unsigned int* tags;  /**< a tag for each block, or null: all are 0 */
} vardel_ip_quarzel_array_inputs;

/** Where the decisions of an array go. Strides are counted in bytes. */
typedef struct vardel_ip_quarzel_array_outputs {
    unsigned char* dout;        /**< K decisions of a block, a byte (0 or 1) each */
    ptrdiff_t block_stride;     /**< from the decisions of a block to those of the next one */
    ptrdiff_t iteration_stride; /**< from the decisions after an iteration to those after the next one, to
                                     have them all; 0: only those after the last iteration are written */
    unsigned int* tags;         /**< receives the masked tag of each decoded block; may be null, or the array
                                     of the inputs' tags */
} vardel_ip_quarzel_array_outputs;

/**
 * Decode the blocks of an array: bits, statuses, messages and warnings are those of
 * vardel_ip_quarzel_bitacc_simulate_batch with the same blocks. The values are read as they are held.
 * What the call writes must not overlap what it reads.
 *
 * @param state     the model
 * @param outputs   where decisions and tags go; untouched for blocks whose status is not 0
 * @param inputs    the blocks
 * @param statuses  receives a status for each block; may be null
 * @return          the first status that is not 0, or 0. Also 1, with nothing done, after one of
 *
 *   ERROR:decoder:Simulate array called with null state structure
 *   ERROR:decoder:Simulate array called with null output structure
 *   ERROR:decoder:Simulate array called with null input structure
 *   ERROR:decoder:value_type must be VARDEL_IP_QUARZEL_INT8, VARDEL_IP_QUARZEL_INT16 or
 * VARDEL_IP_QUARZEL_INT32 ERROR:decoder:count must not be negative
 */
VARDEL_IP_QUARZEL_API int vardel_ip_quarzel_bitacc_simulate_array(
    vardel_ip_quarzel_state* state, const vardel_ip_quarzel_array_outputs* outputs,
    const vardel_ip_quarzel_array_inputs* inputs, int* statuses);

/** The scale that turns log-likelihood ratios into soft values; docs/quantiser.md has the measurements. */
#define VARDEL_IP_QUARZEL_LLR_SCALE 4.0

/**
 * Turn real numbers into soft values: round(scale * value), saturated to -128..127. Halves are rounded to the
 * even number. The product is that of doubles, so a float gives what the double of the same value does.
 *
 * @param values  log-likelihood ratios ln(P(1)/P(0)), or samples, positive for bit 1. Infinite ones are
 *                saturated
 * @param count   values
 * @param scale   units of 1/8 for a value of 1. For log-likelihood ratios VARDEL_IP_QUARZEL_LLR_SCALE; for
 *                samples +-1 + noise of the variance v that times 2 / v
 * @param soft    receives `count` soft values. They must not overlap the values
 * @return        0; or 1, with nothing written, when the scale is not above 0 and finite, or a value is not a
 *                number
 *
 * It needs no state and may be called from any thread.
 */
VARDEL_IP_QUARZEL_API int vardel_ip_quarzel_bitacc_quantise(const double* values, size_t count, double scale,
                                                            int8_t* soft);

/** The same for floats. */
VARDEL_IP_QUARZEL_API int vardel_ip_quarzel_bitacc_quantise_float(const float* values, size_t count,
                                                                  double scale, int8_t* soft);

/** Free a model and all it owns. Null is allowed and does nothing. */
VARDEL_IP_QUARZEL_API void vardel_ip_quarzel_destroy_state(vardel_ip_quarzel_state* state);

/* Messages ------------------------------------------------------------------------------------------- */

/** What a line of a model tells. */
enum {
    VARDEL_IP_QUARZEL_ERROR = 1,   /**< why a call failed */
    VARDEL_IP_QUARZEL_WARNING = 2, /**< a saturated input, a truncated tag */
    VARDEL_IP_QUARZEL_TRACE = 3    /**< a line of a trace */
};

/**
 * Receives the lines of a model.
 *
 * @param cookie  the caller's, as it was given with the receiver
 * @param kind    VARDEL_IP_QUARZEL_ERROR, _WARNING or _TRACE
 * @param text    the whole line, such as "ERROR:decoder:din_size must be a positive integer", without its
 *                line end; valid during the call
 *
 * It is called on the thread that uses the state, during a call. It must not use the state.
 */
typedef void (*vardel_ip_quarzel_message_receiver)(void* cookie, int kind, const char* text);

/**
 * Tell what is wrong with generics. Prints nothing.
 *
 * @param generics  the record; null is wrong, too
 * @return          the line that vardel_ip_quarzel_create_state would write, without "ERROR:decoder:", or
 *                  null when nothing is wrong. The text is constant
 */
VARDEL_IP_QUARZEL_API const char* vardel_ip_quarzel_check_generics(
    const vardel_ip_quarzel_generics* generics);

/**
 * Make a model as vardel_ip_quarzel_create_state does, whose lines go to a receiver from the first one on.
 *
 * @param generics  the record; not kept
 * @param receiver  null: the standard streams
 * @param cookie    handed to the receiver
 * @return          as for vardel_ip_quarzel_create_state
 */
VARDEL_IP_QUARZEL_API vardel_ip_quarzel_state* vardel_ip_quarzel_create_state_with_messages(
    const vardel_ip_quarzel_generics* generics, vardel_ip_quarzel_message_receiver receiver, void* cookie);

/**
 * Send the lines of a model elsewhere from now on.
 *
 * @param state     the model; not tested for null
 * @param receiver  null: the standard streams
 * @param cookie    handed to the receiver
 */
VARDEL_IP_QUARZEL_API void vardel_ip_quarzel_set_messages(vardel_ip_quarzel_state* state,
                                                          vardel_ip_quarzel_message_receiver receiver,
                                                          void* cookie);

/* Passes --------------------------------------------------------------------------------------------- */

/**
 * A pass that has just run: what the trace prints, as integers. A pass is one run through the trellis of a
 * constituent code; two passes, of code 2 and then of code 1, are an iteration.
 *
 * Values are words of the format Fix_12_3, left-aligned in 16 bits: a word is 128 times the number it stands
 * for. Arrays have an entry for each trellis step, K information steps and 3 termination steps, in the order
 * of the code (interleaved for code 2). At the termination steps no core computes metrics; what stands there
 * is left over from other passes and blocks, and the last LLR and extrinsic values with it.
 *
 * All arrays belong to the model and are valid during the call of the receiver.
 */
typedef struct vardel_ip_quarzel_pass {
    unsigned long long block;    /**< blocks that the state decoded before this one */
    unsigned int pass;           /**< number of the pass in its block, from 0 */
    unsigned int code;           /**< constituent code, 1 or 2 */
    unsigned int block_size;     /**< information bits, K */
    unsigned int steps;          /**< trellis steps, K + 3 */
    const int16_t* inputs[2][3]; /**< soft inputs of code 1 and code 2: systematic, first parity and second
                                      parity values (0 in LTE), [steps] each */
    const int16_t* intrinsic;    /**< [steps] channel and a-priori value, at half scale */
    const int16_t* alpha;        /**< [steps][8] forward metrics before each step, by state */
    const int16_t* beta;         /**< [steps][8] backward metrics after each step, by state */
    const int16_t* gamma;     /**< [steps][4] branch metrics g4 to g7: with x twice the intrinsic value and p
                                   and q first and second parity, x - p - q, x - p + q, x + p - q and
                                   x + p + q, each clamped to the branch format */
    const int16_t* llr;       /**< [steps] log-likelihood ratios; a positive one means bit 1 */
    const int16_t* extrinsic; /**< [steps] extrinsic values */
} vardel_ip_quarzel_pass;

/**
 * Receives a pass. It is called on the thread that uses the state, during a call, before the text trace of
 * the same pass is written. It must not use the state.
 */
typedef void (*vardel_ip_quarzel_pass_receiver)(void* cookie, const vardel_ip_quarzel_pass* pass);

/**
 * Hand the next passes to a receiver, counted on across blocks. Decoding goes on after the last one.
 *
 * @param state     the model; not tested for null
 * @param count     passes; 0 ends it
 * @param receiver  null ends it, too
 * @param cookie    handed to the receiver
 * @return          0, or 1 when there is no memory for it; a line says so
 */
VARDEL_IP_QUARZEL_API int vardel_ip_quarzel_set_passes(vardel_ip_quarzel_state* state, unsigned int count,
                                                       vardel_ip_quarzel_pass_receiver receiver,
                                                       void* cookie);

/* Implementation ------------------------------------------------------------------------------------- */

/**
 * The implementations that this machine can run, best first: the instruction sets that decode blocks in
 * SIMD lanes, and at last "literal", which decodes step by step. All give the same bits and messages.
 *
 * @param index  from 0
 * @return       a name such as "avx2", constant; null when there are no more
 */
VARDEL_IP_QUARZEL_API const char* vardel_ip_quarzel_get_implementation_name(int index);

/**
 * The implementation that a state has chosen: the best one at first. Blocks that are traced, and those of a
 * size that the core refuses, are decoded literally all the same.
 *
 * @param state  the model; not tested for null
 * @return       its name
 */
VARDEL_IP_QUARZEL_API const char* vardel_ip_quarzel_get_implementation(const vardel_ip_quarzel_state* state);

/**
 * Choose the implementation.
 *
 * @param state  the model; not tested for null
 * @param name   one of those that vardel_ip_quarzel_get_implementation_name gives
 * @return       0; or 1, with nothing changed, after
 *
 *   ERROR:decoder:There is no implementation 'name' on this machine
 */
VARDEL_IP_QUARZEL_API int vardel_ip_quarzel_set_implementation(vardel_ip_quarzel_state* state,
                                                               const char* name);

/* Code ----------------------------------------------------------------------------------------------- */

/** A block size with the parameters of its permutation (3GPP TS 36.212, Table 5.1.3-3). */
typedef struct vardel_ip_quarzel_block_size {
    unsigned int K;  /**< information bits */
    unsigned int f1; /**< interleaved position i reads position (f1 i + f2 i^2) mod K */
    unsigned int f2;
} vardel_ip_quarzel_block_size;

/**
 * The 188 block sizes, in ascending order.
 *
 * @param index  from 0 to 187
 * @param size   receives the size
 * @return       0; or 1, with nothing written, when there is no such index
 */
VARDEL_IP_QUARZEL_API int vardel_ip_quarzel_get_block_size(int index, vardel_ip_quarzel_block_size* size);

/**
 * The permutation between the constituent codes.
 *
 * @param K            a block size
 * @param permutation  receives K entries: the natural position that is read at each interleaved one
 * @return             0; or 1, with nothing written, when there is no such block size or not enough memory
 */
VARDEL_IP_QUARZEL_API int vardel_ip_quarzel_get_permutation(unsigned int K, unsigned int* permutation);

/** How a core cuts a block. */
typedef struct vardel_ip_quarzel_layout {
    unsigned int threads;          /**< threads of the core, 4 a processing unit */
    unsigned int segments;         /**< thread segments of the block, of equal length */
    unsigned int segment_steps;    /**< trellis steps of a segment */
    unsigned int windows;          /**< backward windows of a segment */
    unsigned int window_steps[16]; /**< their lengths, from the lowest step up */
} vardel_ip_quarzel_layout;

/**
 * The segments and windows that a core cuts a block into.
 *
 * @param K       a block size
 * @param units   processing units: 2, 4 or 8
 * @param layout  receives the layout
 * @return        0; or 1, with nothing written, when there is no such size or core
 */
VARDEL_IP_QUARZEL_API int vardel_ip_quarzel_get_layout(unsigned int K, unsigned int units,
                                                       vardel_ip_quarzel_layout* layout);

/** A signal of a pass. */
typedef struct vardel_ip_quarzel_signal {
    const char* name;        /**< in traces: "int", "a", "b", "g", "llr" or "ext" */
    const char* description; /**< in words */
    unsigned int width;      /**< values for each trellis step: 1, 8 or 4 */
    unsigned int first;      /**< number of the first one: the columns of g are g4 to g7 */
} vardel_ip_quarzel_signal;

/**
 * The signals of a pass, in the order of a trace's columns and of the members of vardel_ip_quarzel_pass.
 *
 * @param index   from 0
 * @param signal  receives the signal; its texts are constant
 * @return        0; or 1, with nothing written, when there are no more
 */
VARDEL_IP_QUARZEL_API int vardel_ip_quarzel_get_signal(int index, vardel_ip_quarzel_signal* signal);

/** A branch of the trellis of the constituent codes. */
typedef struct vardel_ip_quarzel_branch {
    unsigned int from;   /**< encoder state before the step, 0 to 7 */
    unsigned int to;     /**< encoder state after it */
    unsigned int metric; /**< number of the branch metric that it carries, 4 to 7: g4 to g7. The branch of bit
                            1 adds it, that of bit 0 takes it away */
} vardel_ip_quarzel_branch;

/**
 * The branches of the trellis.
 *
 * @param state   encoder state that the branch leaves, 0 to 7
 * @param bit     information bit of the branch, 0 or 1
 * @param branch  receives the branch
 * @return        0; or 1, with nothing written, when there is no such branch
 */
VARDEL_IP_QUARZEL_API int vardel_ip_quarzel_get_branch(unsigned int state, unsigned int bit,
                                                       vardel_ip_quarzel_branch* branch);

/**
 * The corrections that algorithm type 2 adds to a maximum, ln(1 + e^-|d|) of the difference d of its
 * candidates, in units of 1/8.
 *
 * @param corrections  receives 4096 entries, for the differences -2048 to 2047 in units of 1/8
 * @return             0; or 1, with nothing written, when there is no memory
 */
VARDEL_IP_QUARZEL_API int vardel_ip_quarzel_get_corrections(unsigned char* corrections);

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
 * and cannot decode: calls that try give status 99. Free it with vardel_ip_quarzel_destroy_state.
 *
 * @return  the record, or null after "ERROR:decoder:Could not allocate memory for decoder state"
 */
VARDEL_IP_QUARZEL_API vardel_ip_quarzel_state* create_default_state(vardel_ip_quarzel_generics generics)
    VARDEL_IP_QUARZEL_LABEL("_Z20create_default_state26vardel_ip_quarzel_generics");

#undef VARDEL_IP_QUARZEL_LABEL
#endif

#endif
