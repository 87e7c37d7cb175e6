// SPDX-License-Identifier: MIT
#include "sweeps/sweep_command.hpp"

#include <CLI/CLI.hpp>
#include <memory>
#include <string>
#include <utility>

#include "options/threads_option.hpp"
#include "options/whole_number.hpp"
#include "sweeps/sweep_run.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

constexpr const char* description = "Simulate a link: error rates over Eb/N0";

constexpr const char* footer = R"(A point is a block size, a core and an Eb/N0. Its blocks of random bits are
encoded, sent as -1 and +1 with white Gaussian noise, quantised to the 8 bits of
the core, decoded and compared. Eb/N0 is for an information bit at rate 1/3: the
noise has the variance 1.5 / (Eb/N0); the 12 tail bits are not counted. All
cores and quantisers get the same bits and the same noise.

With --code-rate, --coded-bits, --modulation, --channel, --demapping, --rv,
--harq, --transport-block or --stop blocks pass the chain of LTE: CRCs and
segmentation of transport blocks, rate matching, symbols, fading that the
receiver knows, soft values added up over transmissions. Eb/N0 then counts the
information bits for each coded bit of one transmission. A block is sent again
until the receiver accepts it: its CRCs hold or, without CRC, no bit is wrong.
Errors are what is left after so many transmissions; the throughput is the
information bits of right blocks for each coded bit that was sent. With --stop
crc it is told how many iterations a receiver would use that looks at the CRCs
after each of them; the core still runs them all.

What is counted at a point depends only on the seed, the point and the number of
its blocks: not on threads, parts, interruptions or the machine. (That number
depends on the clock with --max-time.) The interval holds the true block error
rate with a probability of 95 %.

Files:
  OUT         the result, JSON: for 'quarzel show', 'quarzel plot' and 'quarzel
              verify-result'. A result that is already there is extended: new
              points are added, points with fewer blocks than asked for go on
              where they ended, nothing is decoded twice and no point is lost.
              With --shard it is a part of a result, for 'quarzel merge'. It is
              written at the end, whole or not at all. With - it goes to
              standard output, and the table to standard error.
  FILE        what is done so far, renewed while the sweep runs and when it is
              interrupted (SIGINT, SIGTERM, SIGHUP), removed once the result is
              in its place. --resume goes on from it, or begins at the beginning
              when there is none. FILE.lock and OUT.lock keep other
              commands from them.

  OUT.failures
              with --keep-failures: captures of failing blocks, those with the
              lowest numbers at each point of OUT, for 'quarzel decode'. For
              each size and core NAME.soft.npy holds the soft values and
              NAME.sent.npy the bits that were sent; failures.csv tells of each
              row the seed, the point in OUT and the number of the block, all
              counted from 0. 'quarzel rebuild' makes any block again.

A sweep of more than a second tells on standard error how far it is: on a
terminal as a growing table, elsewhere as a line for each point that has ended
and one a minute for the whole. Without OUT an interruption prints what is done.

Examples:
  quarzel sweep --ebn0 0:0.2:1 --iterations 8 -o result.json
  quarzel sweep --ebn0 0:0.2:1 --algorithm 0,1,2 --block-size 40,6144 --csv
  quarzel sweep --ebn0 0:0.1:1.4 --iterations 8 -o result.json
  quarzel sweep --ebn0 2:1:8 --code-rate 3/4 --modulation 16qam --harq 4
  quarzel sweep --ebn0 1:0.1:2 --max-blocks 1000000 --shard 3/16 -o part3.json
)";

}  // namespace

void addSweepCommand(CLI::App& app, std::ostream& results, MakeWorkers makeWorkers) {
    auto options = std::make_shared<SweepRunOptions>();
    CLI::App* command = app.add_subcommand("sweep", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    addSweepOptions(*command, options->sweep);
    command->add_option("-o,--output", options->output, "Write the result to this file")->type_name("OUT");
    command
        ->add_option("--checkpoint", options->checkpoint,
                     "Keep what is done in this file (default:\nOUT.checkpoint)")
        ->type_name("FILE");
    command
        ->add_option("--checkpoint-every", options->checkpointSeconds, "How often it is renewed (default 30)")
        ->type_name("SECONDS")
        ->transform(wholeNumber([](std::uint64_t n) { return n <= 86400; }, "a number from 0 to 86400"));
    command->add_flag("--resume", options->resume, "Go on where an earlier run was interrupted");
    command
        ->add_option("--keep-failures", options->keptFailures,
                     "Keep the first N failing blocks of each point in\nOUT.failures (default none)")
        ->type_name("N")
        ->transform(
            wholeNumber([](std::uint64_t n) { return n >= 1 && n <= 1000; }, "a number from 1 to 1000"));
    addThreadsOption(*command, options->threads);
    addFormOptions(*command, options->form);
    command->callback([options, &results, makeWorkers = std::move(makeWorkers)] {
        SweepRun(*options, results).run(makeWorkers);
    });
}

}  // namespace quarzel::tool
