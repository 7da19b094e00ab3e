#!/usr/bin/env bash
# The Status tab's cost while nothing happens: 10,000 jobs in the status
# journal, 100 of them in progress (the busy wheel turns), the journal left
# alone. Prints the program's CPU time over the window, from /proc/PID/stat.
#   bench/status_idle_cpu.sh [BIN_DIR] [SECONDS]     (default build/bin, 60)
# Runs on the current display, or on a virtual one (xvfb-run) when there is none.
set -euo pipefail
bin=$(cd "${1:-build/bin}" && pwd)
seconds=${2:-60}
if [ -z "${DISPLAY:-}" ]; then
    exec xvfb-run -a -s "-screen 0 1280x1024x24" "$0" "$bin" "$seconds"
fi

root=$(mktemp -d /tmp/wyx-idle.XXXXXX)
app=
cleanup() {
    [ -n "$app" ] && kill "$app" 2>/dev/null && wait "$app" 2>/dev/null
    rm -rf "$root"
}
trap cleanup EXIT

data=$root/var/lib/Corvane/HotFolders
mkdir -p "$data" "$root/run" && chmod 700 "$root/run"
awk 'BEGIN {
    for (job = 0; job < 10000; ++job) {
        status = job % 100 == 0 ? "Saving..." : "Queued"
        printf "%d\t/srv/in/Proofs\t/srv/in/Proofs/job %05d.pdf\tPRN-0%d\t%d\t%s\t%d\tPDF\tADDED\n",
               job, job, job % 4, 1383035055 + job, status, 4096 + job
    }
}' > "$data/TiveraJobsStatusFile.txt"

HOME=$root WYX_SYSTEM_ROOT=$root XDG_RUNTIME_DIR=$root/run NO_AT_BRIDGE=1 "$bin/WyxProgress" &
app=$!
# Started, read the journal and painted it.
sleep 5
ticks() { awk '{ print $14 + $15 }' "/proc/$app/stat"; }
per_second=$(getconf CLK_TCK)
before=$(ticks)
sleep "$seconds"
after=$(ticks)
awk -v used=$((after - before)) -v hz="$per_second" -v s="$seconds" 'BEGIN {
    printf "idle with 10,000 jobs, 100 in progress: %.2f s of CPU in %d s = %.2f %% of one core\n",
           used / hz, s, 100 * used / hz / s
}'
