#!/usr/bin/env bash
# Ten minutes of a busy and hostile day: the program beside wyx-simulator at
# 20 jobs a second and a writer that garbles, truncates and replaces the
# journals, holds their locks and plants a FIFO and a folder where the lock
# files belong. Prints the program's resident memory at start and end, its
# CPU time minute by minute, and how often it still polled in the last minute
# (stat calls on the status journal, counted with strace: one or two a poll).
#   bench/soak.sh [BIN_DIR] [MINUTES]     (default build/bin, 10)
set -euo pipefail
bin=$(cd "${1:-build/bin}" && pwd)
minutes=${2:-10}
if [ -z "${DISPLAY:-}" ]; then
    exec xvfb-run -a -s "-screen 0 1280x1024x24" "$0" "$bin" "$minutes"
fi

root=$(mktemp -d /tmp/wyx-soak.XXXXXX)
pids=()
cleanup() {
    for pid in "${pids[@]}"; do kill "$pid" 2>/dev/null || true; done
    wait 2>/dev/null || true
    rm -rf "$root"
}
trap cleanup EXIT
export WYX_SYSTEM_ROOT=$root HOME=$root/home XDG_RUNTIME_DIR=$root/run NO_AT_BRIDGE=1
mkdir -p "$HOME" "$XDG_RUNTIME_DIR" && chmod 700 "$XDG_RUNTIME_DIR"
data=$root/var/lib/Corvane/HotFolders
locks=$root/dev/shm

"$bin/wyx-simulator" --rate 20/s --duration $((minutes * 60 + 30)) --step-seconds 1 --seed 5 >/dev/null 2>&1 &
pids+=($!)
sleep 2
"$bin/WyxProgress" &
app=$!
pids+=($app)
sleep 3

hostile() {
    # Each act may race with the service or the program; a failed one is just skipped.
    set +e
    local round=0 journal lock
    while true; do
        round=$((round + 1))
        journal=$data/TiveraJobsStatusFile.txt
        [ $((round % 2)) -eq 0 ] && journal=$data/TiveraJobsLogFile.txt
        case $((round % 8)) in
            0) printf 'garbage\t\377\376\tline\n\0\0\0\n' >> "$journal" ;;
            1) head -c 100000 /dev/urandom | tr -d '\n' >> "$journal"; echo >> "$journal" ;;
            2) : > "$journal" ;;
            3) flock "$locks/$(basename "$journal" .txt).lock" sleep 3 ;;
            4) mv "$journal" "$journal.away"; mkfifo "$journal"; sleep 2; rm -f "$journal"
               mv "$journal.away" "$journal" 2>/dev/null || true ;;
            5) lock=$locks/TiveraJobsStatusFile.lock; rm -f "$lock"; mkfifo "$lock"; sleep 2; rm -f "$lock" ;;
            6) lock=$locks/TiveraJobsLogFile.lock; rm -f "$lock"; mkdir "$lock"; sleep 2; rmdir "$lock" ;;
            7) printf '%s\tADDED\n' "$(head -c 3000000 /dev/zero | tr '\0' 'x')" >> "$journal" ;;
        esac
        sleep 0.5
    done
}
hostile 2>/dev/null &
pids+=($!)

rss() { awk '/^VmRSS:/ { print $2 " kB" }' "/proc/$app/status"; }
ticks() { awk '{ print $14 + $15 }' "/proc/$app/stat"; }
hz=$(getconf CLK_TCK)
echo "resident at start: $(rss)"
for minute in $(seq 1 "$minutes"); do
    before=$(ticks)
    if [ "$minute" -eq "$minutes" ] && command -v strace >/dev/null; then
        timeout 60 strace -f -qq -e trace=stat,newfstatat,statx -o "$root/stat.trace" -p "$app" 2>/dev/null || true
    else
        sleep 60
    fi
    kill -0 "$app" 2>/dev/null || { echo "the program ended during minute $minute"; exit 1; }
    awk -v used=$(($(ticks) - before)) -v hz="$hz" -v m="$minute" \
        'BEGIN { printf "minute %2d: %.2f s of CPU (%.1f %% of one core)\n", m, used / hz, 100 * used / hz / 60 }'
done
echo "resident at end: $(rss); peak: $(awk '/^VmHWM:/ { print $2 " kB" }' "/proc/$app/status")"
if [ -f "$root/stat.trace" ]; then
    echo "stat calls on the status journal in the last minute: $(grep -c TiveraJobsStatusFile.txt "$root/stat.trace" || true)"
fi
