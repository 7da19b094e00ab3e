#!/usr/bin/env bash
# The program's memory beside status journals of 10,000, 100,000, 400,000 and 1,000,000
# lines: peak and resident once it has read and shown one, then resident again
# after the journal shrank to three lines. A journal beyond the read limit
# (64 MiB) is not read at all: the previous rows stay, and so does the memory.
#   bench/memory_by_journal.sh [BIN_DIR]     (default build/bin)
set -euo pipefail
bin=$(cd "${1:-build/bin}" && pwd)
if [ -z "${DISPLAY:-}" ]; then
    exec xvfb-run -a -s "-screen 0 1280x1024x24" "$0" "$bin"
fi

write_journal() { # FILE LINES
    awk -v n="$2" 'BEGIN {
        for (job = 0; job < n; ++job)
            printf "%d\t/srv/in/Proofs\t/srv/in/Proofs/job %07d.pdf\tPRN-0%d\t%d\tQueued\t%d\tPDF\tADDED\n",
                   job, job, job % 4, 1383035055 + job, 4096 + job
    }' > "$1"
}
field() { awk -v name="$1:" '$1 == name { print $2 }' "/proc/$2/status"; }

printf '%-10s %10s %12s %14s %18s\n' lines "file (MB)" "peak (MB)" "resident (MB)" "after shrink (MB)"
for lines in 10000 100000 400000 1000000; do
    root=$(mktemp -d /tmp/wyx-memory.XXXXXX)
    data=$root/var/lib/Corvane/HotFolders
    mkdir -p "$data" "$root/run" && chmod 700 "$root/run"
    write_journal "$data/TiveraJobsStatusFile.txt" "$lines"
    size=$(stat -c %s "$data/TiveraJobsStatusFile.txt")
    HOME=$root WYX_SYSTEM_ROOT=$root XDG_RUNTIME_DIR=$root/run NO_AT_BRIDGE=1 "$bin/WyxProgress" &
    app=$!
    sleep $((4 + lines / 100000 * 2))
    peak=$(field VmHWM $app); resident=$(field VmRSS $app)
    write_journal "$data/TiveraJobsStatusFile.txt" 3
    sleep 5
    after=$(field VmRSS $app)
    kill $app; wait $app 2>/dev/null || true
    awk -v l="$lines" -v s="$size" -v p="$peak" -v r="$resident" -v a="$after" 'BEGIN {
        printf "%-10d %10.0f %12.0f %14.0f %18.0f\n", l, s / 1048576, p / 1024, r / 1024, a / 1024 }'
    rm -rf "$root"
done
