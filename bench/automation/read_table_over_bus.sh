#!/usr/bin/env bash
# What an accessibility tool costs the program. Starts WyxProgress with ROWS
# jobs (none in progress: the busy wheel stands still) on a session bus and a
# display of its own, then
#   - times wyx-inspect reading every cell of the Status table over the bus,
#     RUNS times (a separate Python process, as a tool is);
#   - keeps a tool attached (wyx-inspect --listen, listening for every kind of
#     event) for SECONDS and prints the program's CPU time meanwhile.
#   bench/automation/read_table_over_bus.sh [BIN_DIR] [ROWS] [RUNS] [SECONDS]
#                                               (default build/bin, 1000, 3, 20)
set -euo pipefail
bin=$(cd "${1:-build/bin}" && pwd)
rows=${2:-1000}
runs=${3:-3}
seconds=${4:-20}
if [ -z "${WYX_BENCH_INNER:-}" ]; then
    export WYX_BENCH_INNER=1
    exec dbus-run-session -- xvfb-run -a -s "-screen 0 1280x1024x24" "$0" "$bin" "$rows" "$runs" "$seconds"
fi

root=$(mktemp -d /tmp/wyx-a11y-bench.XXXXXX)
app=
cleanup() {
    if [ -n "$app" ]; then kill "$app" 2>/dev/null || true; wait "$app" 2>/dev/null || true; fi
    rm -rf "$root"
}
trap cleanup EXIT

data=$root/var/lib/Corvane/HotFolders
mkdir -p "$data" "$root/run" && chmod 700 "$root/run"
: > "$data/TiveraJobsStatusFile.txt"
awk -v rows="$rows" 'BEGIN {
    for (job = 0; job < rows; ++job)
        printf "%d\t/srv/in/Proofs\t/srv/in/Proofs/job %05d.pdf\tPRN-0%d\t%d\tQueued\t%d\tPDF\n",
               job, job, job % 4, 1383035055 + job, 4096 + job
}' | WYX_SYSTEM_ROOT=$root "$bin/wyx-journal" status add - >/dev/null

HOME=$root WYX_SYSTEM_ROOT=$root XDG_RUNTIME_DIR=$root/run LANG=C.UTF-8 GDK_BACKEND=x11 "$bin/WyxProgress" &
app=$!
inspect() { /usr/bin/python3 "$bin/wyx-inspect" --pid "$app" --wait 60 "$@"; }
inspect --only jobStatusList --wait-rows "$rows" >/dev/null

echo "reading every cell of a $rows-row, 8-column table over the bus:"
for run in $(seq "$runs"); do
    inspect --only jobStatusList --timing 2>&1 >/dev/null | sed 's/^/  /'
done

ticks() { awk '{ print $14 + $15 }' "/proc/$app/stat"; }
per_second=$(getconf CLK_TCK)
report() {
    awk -v used="$2" -v hz="$per_second" -v s="$seconds" -v what="$1" 'BEGIN {
        printf "%s for %d s: %.2f s of CPU = %.2f %% of one core\n", what, s, used / hz, 100 * used / hz / s
    }'
}
before=$(ticks)
sleep "$seconds"
report "idle, no tool attached" $(($(ticks) - before))
# The tool attaches, reads a box and registers for every event, then waits.
before=$(ticks)
inspect --only serverFilter --listen "$seconds" >/dev/null
report "idle, a tool attached and listening" $(($(ticks) - before))
