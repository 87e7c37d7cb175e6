#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Run the fuzzers: fuzz.sh SECONDSs|EXECUTIONS [TARGET...], as fuzz.sh 300s or fuzz.sh 1000000 traces
# A target is a folder of fuzz/corpus. What is learnt is kept in build/fuzz/corpus for the next time. A line for each
# target tells executions and coverage; an input that shows a fault ends its target and is kept in build/fuzz/findings.
set -euo pipefail
cd "$(dirname "$0")/.."
case "${1:-}" in
[1-9]*s) limit=-max_total_time=${1%s} ;;
[1-9]*) limit=-runs=$1 ;;
*)
    echo "usage: fuzz.sh SECONDSs|EXECUTIONS [TARGET...]" >&2
    exit 2
    ;;
esac
shift
targets=("$@")
[ ${#targets[@]} -gt 0 ] || mapfile -t targets < <(ls fuzz/corpus)
scripts/build.sh fuzz
mkdir -p build/fuzz/findings
# Short call stacks of allocations, and few of them, make the readers twice as fast.
export ASAN_OPTIONS=malloc_context_size=2:quarantine_size_mb=16
findings=0
printf '%-18s %12s %9s %9s %8s %8s\n' target executions edges features seconds findings
for target in "${targets[@]}"; do
    learnt=build/fuzz/corpus/$target
    log=build/fuzz/$target.log
    program=build/fuzz/fuzz/fuzz_$target
    [ -x "$program" ] || program=build/fuzz/fuzz/fuzz_readers
    mkdir -p "$learnt"
    finding=0
    # Lines of the model on the standard streams are of no interest here, and slow. So is entropic scheduling.
    "$program" "$limit" -entropic=0 -close_fd_mask=3 -max_len=2048 -timeout=25 -rss_limit_mb=2048 -print_final_stats=1 \
        -dict="fuzz/dictionaries/$target.dict" -artifact_prefix="build/fuzz/findings/$target-" \
        "$learnt" "fuzz/corpus/$target" >"$log" 2>&1 || finding=1
    findings=$((findings + finding))
    awk -v target="$target" -v finding=$finding '
        / cov: / { for (i = 1; i < NF; ++i) { if ($i == "cov:") edges = $(i + 1); if ($i == "ft:") features = $(i + 1) } }
        /^stat::number_of_executed_units:/ { executions = $2 }
        /^Done / { seconds = $5 }
        END { printf "%-18s %12s %9s %9s %8s %8d\n", target, executions, edges, features, seconds, finding }' "$log"
    [ $finding = 0 ] || grep -E '^SUMMARY|Test unit written|does not hold' "$log" || true
done
echo "fuzz: ${#targets[@]} targets, $findings with a finding"
[ $findings = 0 ]
