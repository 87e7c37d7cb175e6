#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Run the fuzzers: fuzz.sh SECONDSs|EXECUTIONS [TARGET...], as fuzz.sh 300s or fuzz.sh 1000000 traces
# What they learn is kept in build/fuzz/corpus for the next time. A line for each tells executions and coverage; a
# finding ends them all, with its input in build/fuzz/findings.
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
printf '%-18s %12s %9s %9s %8s\n' target executions edges features seconds
for target in "${targets[@]}"; do
    learnt=build/fuzz/corpus/$target
    log=build/fuzz/$target.log
    mkdir -p "$learnt"
    # Lines of the model on the standard streams are of no interest here, and slow.
    if ! "build/fuzz/fuzz/fuzz_$target" "$limit" -close_fd_mask=3 -timeout=60 \
        -dict="fuzz/dictionaries/$target.dict" -artifact_prefix="build/fuzz/findings/$target-" \
        "$learnt" "fuzz/corpus/$target" >"$log" 2>&1; then
        tail -40 "$log" >&2
        exit 1
    fi
    awk -v target="$target" '
        / cov: / { for (i = 1; i < NF; ++i) { if ($i == "cov:") edges = $(i + 1); if ($i == "ft:") features = $(i + 1) } }
        /^Done / { executions = $2; seconds = $5 }
        END { printf "%-18s %12s %9s %9s %8s\n", target, executions, edges, features, seconds }' "$log"
done
