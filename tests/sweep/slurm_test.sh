#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# The Slurm scripts of docs/cluster.md run as they are written, on a Slurm of one node that this test brings up in a
# folder of its own: slurm_test.sh SOURCE BUILD. Needs slurm-wlm, munge and MPI, not the superuser. Scripts whose jobs
# are to reach their time limit get one of a minute on sbatch's command line and a longer sweep: 200,000 blocks a point
# instead of 20,000, Eb/N0 up to 2 dB instead of 1. Those of MPI get 4 ranks.
set -euo pipefail
project=$(realpath "$1")
build=$(realpath "$2")
PATH=$build/tools/quarzel:$build/tools/quarzel_mpi:$PATH
. "$project/tests/support/page_blocks.sh"
folder=$(mktemp -d)
chmod 711 "$folder" # munged wants its socket in the reach of everybody
cd "$folder"
export SLURM_CONF=$folder/slurm.conf

clean_up() {
    set +e
    scancel --quiet --user "$(id -un)" && wait_for_jobs 60
    # shellcheck disable=SC2046
    kill $(jobs -p)
    wait
    rm -rf "$folder"
} 2>/dev/null
trap clean_up EXIT
fail() {
    echo "slurm_test.sh: $1" >&2
    tail -n 20 slurm-*.out ./*.log >&2
    exit 1
}
# Wait until a command succeeds: wait_until SECONDS COMMAND...
wait_until() {
    local end=$((SECONDS + $1))
    until "${@:2}" >/dev/null 2>&1; do
        [ "$SECONDS" -lt "$end" ] || return 1
        sleep 0.5
    done
}
queue_is_empty() { [ -z "$(squeue --noheader)" ]; }
wait_for_jobs() { wait_until "$1" queue_is_empty; }
node_is_idle() { [ "$(sinfo --noheader --format=%T)" = idle ]; }

# A node of one processor, the first of this machine's that may be used, so that a sweep lasts as long everywhere. It is
# given out as eight. Slurm looks at time limits every 30 seconds.
start_slurm() {
    local host ports user
    host=$(hostname -s)
    user=$(id -un)
    ports=$(/usr/bin/python3 -c '
import socket
sockets = [socket.create_server(("127.0.0.1", 0)) for _ in range(2)]
print(*(s.getsockname()[1] for s in sockets))')
    mkdir state spool
    (umask 077 && head -c 1024 /dev/urandom >key)
    cat >slurm.conf <<CONF
ClusterName=sweeps
SlurmctldHost=$host(127.0.0.1)
SlurmUser=$user
SlurmdUser=$user
SlurmctldPort=${ports% *}
SlurmdPort=${ports#* }
AuthType=auth/munge
AuthInfo=socket=$folder/munge,cred_expire=5
CredType=cred/munge
StateSaveLocation=$folder/state
SlurmdSpoolDir=$folder/spool
SlurmctldPidFile=$folder/slurmctld.pid
SlurmdPidFile=$folder/slurmd.pid
PlugStackConfig=/dev/null
ProctrackType=proctrack/linuxproc
TaskPlugin=task/none
SelectType=select/cons_tres
SelectTypeParameters=CR_Core
SchedulerParameters=sched_interval=2,bf_interval=2
MinJobAge=86400
SlurmdParameters=config_overrides
NodeName=$host NodeAddr=127.0.0.1 CPUs=8
PartitionName=all Nodes=$host Default=YES
CONF
    munged --foreground --socket="$folder/munge" --key-file="$folder/key" --log-file="$folder/munged.log" \
        --pid-file="$folder/munged.pid" --seed-file="$folder/seed" 2>munged_start.log &
    wait_until 30 munge --no-input --socket="$folder/munge" || fail "munged does not start"
    slurmctld -D -c >slurmctld.log 2>&1 &
    taskset -c "$(taskset -cp $$ | sed 's/.*: \([0-9]*\).*/\1/')" slurmd -D >slurmd.log 2>&1 &
    wait_until 60 node_is_idle || fail "the node does not get ready"
}

# Run a script as a job until nothing is left in the queue: run STOPS FILE [OPTION...]; STOPS is "stopped" if the time
# limit is to have stopped it at least once, otherwise "at once". Each stop has brought back what it stopped, no more;
# mpirun passes on nothing that rank 0 says after the signal, so that its stops cannot be counted.
run() {
    local job states restarts stops
    job=$(sbatch --parsable "${@:3}" "$2")
    wait_for_jobs 3600 || fail "$2 does not end"
    states=$(scontrol show job "$job" | sed -n 's/.*JobState=\([A-Z_]*\).*/\1/p' | sort -u)
    [ "$states" = COMPLETED ] || fail "$2 ended as $states"
    restarts=$(scontrol show job "$job" | sed -n 's/.*Restarts=\([0-9]*\).*/\1/p' | awk '{ sum += $1 } END { print sum }')
    stops=$(cat slurm-"$job"*.out | grep -c "interrupted when" || true)
    [ "$restarts" -eq "$stops" ] || [ "$2" = mpirun.sbatch ] ||
        fail "$2 was stopped $stops times and restarted $restarts times"
    if [ "$1" = stopped ]; then
        [ "$restarts" -gt 0 ] || fail "the time limit did not stop $2: is the sweep too short for this machine?"
    else
        [ "$restarts" -eq 0 ] || fail "$2 was stopped"
    fi
    echo "ok: ${*:2}, restarted $restarts times"
}
same() {
    cmp "$1" "$2" || fail "$2 is not the result of one run"
}

start_slurm
blocks docs/cluster.md sh Parts | sed -n '/^#!/,$p' >sweep.sbatch
blocks docs/cluster.md sh MPI | sed -n '/^#!/,$p' >mpi.sbatch
options() { sed -n '/quarzel.* sweep/,/&$/p' "$1" | tr -d '\\\n' | sed 's/.* sweep//; s/--threads.*//; s/--resume.*//'; }
one_run() {
    # shellcheck disable=SC2046
    quarzel sweep $(options "$1") -o "$2" >one_run.log 2>&1 || fail "one run of $1 fails"
}

one_run sweep.sbatch one.json
run "at once" sweep.sbatch
quarzel merge part*.json -o result.json >merge.log
same one.json result.json
rm part*.json result.json

sed 's/--max-blocks 20000/--max-blocks 200000/' sweep.sbatch >long_sweep.sbatch
one_run long_sweep.sbatch long_one.json
run stopped long_sweep.sbatch --time=1
quarzel merge part*.json -o result.json >merge.log
same long_one.json result.json
rm part*.json result.json

# A job that its user ends does not come back, and what it did is kept.
job=$(sbatch --parsable --array=1 long_sweep.sbatch)
wait_until 60 grep -q "block errors" "slurm-${job}_1.out" || fail "the sweep to be cancelled does not begin"
scancel "$job"
wait_for_jobs 60 || fail "a cancelled job comes back"
grep -q "interrupted when" "slurm-${job}_1.out" && [ -s part1.json.checkpoint ] ||
    fail "a cancelled job loses what is done"
echo "ok: scancel ends long_sweep.sbatch, its checkpoint is kept"
rm part1.json.checkpoint

# mpirun would give each rank a processor of its own, and refuse the superuser.
export OMPI_MCA_hwloc_base_binding_policy=none OMPI_ALLOW_RUN_AS_ROOT=1 OMPI_ALLOW_RUN_AS_ROOT_CONFIRM=1
sed 's/0:0.2:1 /0:0.2:2 /' mpi.sbatch >srun.sbatch
# As the page says for MPI without PMIx.
sed 's/^srun --mpi=pmix/mpirun/; s/scancel --signal=TERM "$SLURM_JOB_ID"/kill "$sweep"/' srun.sbatch >mpirun.sbatch
cmp -s srun.sbatch mpirun.sbatch && fail "the script of MPI is not the one this test knows"
one_run mpi.sbatch mpi_one.json
run "at once" mpi.sbatch --ntasks=4
same mpi_one.json result.json
one_run srun.sbatch long_mpi_one.json
for script in srun.sbatch mpirun.sbatch; do
    rm result.json
    run stopped $script --ntasks=4 --time=1
    same long_mpi_one.json result.json
done
