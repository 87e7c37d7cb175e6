# SPDX-License-Identifier: MIT
# For scripts that run checks in parts, which source it. A part is a function part_NAME. It may be started alone, its
# output goes to a log, and a summary ends the run.

# Run parts: run_parts TIER RESUME PART...
# With RESUME=yes a part that has passed at this commit, with nothing changed since, is not run again.
run_parts() {
    local tier=$1 resume=$2 part begin status failed=0 summary=()
    shift 2
    local folder=build/checks/$tier state
    mkdir -p "$folder"
    # Where git knows of no commit, nothing has passed before.
    state=$({ git rev-parse HEAD && git diff HEAD; } 2>/dev/null | sha256sum) || state=
    for part in "$@"; do
        if ! declare -F "part_$part" >/dev/null; then
            echo "There is no part '$part'" >&2
            return 2
        fi
    done
    for part in "$@"; do
        if [ "$resume" = yes ] && [ -n "$state" ] && [ "$(cat "$folder/$part.passed" 2>/dev/null)" = "$state" ]; then
            summary+=("$(printf '%-24s passed before' "$part")")
            continue
        fi
        rm -f "$folder/$part.passed"
        echo "$part (log in $folder/$part.log)"
        begin=$SECONDS
        # In a shell of its own, which ends at the first command that fails, and with all that it has started when this
        # run is stopped.
        set -m
        (set -e; "part_$part") >"$folder/$part.log" 2>&1 </dev/null &
        set +m
        trap "kill -- -$!; exit 130" HUP INT TERM
        status=0
        wait $! || status=$?
        trap - HUP INT TERM
        if [ $status -eq 0 ]; then
            echo "$state" >"$folder/$part.passed"
            summary+=("$(printf '%-24s passed %6d s' "$part" $((SECONDS - begin)))")
        else
            failed=1
            tail -30 "$folder/$part.log" >&2
            summary+=("$(printf '%-24s FAILED %6d s' "$part" $((SECONDS - begin)))")
        fi
    done
    printf '\nSummary of %s\n' "$tier"
    printf '%s\n' "${summary[@]}"
    return $failed
}
