#!/usr/bin/env bash
# Retakes the README's pictures of the window from a real run of the demo: the
# program beside the service simulator on a virtual display, the Status tab
# after a few seconds of jobs (status-tab.png), then the Log tab's error log with
# the first failed job selected (log-tab.png).
#   resources/screenshots/take-screenshot.sh [build folder, default build]
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
bin=$(cd "${1:-$here/../../build}" && pwd)/bin
demo=$(mktemp -d /tmp/wyx-shot.XXXXXX)
simulator=
cleanup() {
    [ -n "$simulator" ] && kill "$simulator" 2>/dev/null && wait "$simulator" 2>/dev/null
    rm -rf "$demo"
}
trap cleanup EXIT
mkdir -p "$demo/home/.config" "$demo/run" && chmod 700 "$demo/run"
export WYX_SYSTEM_ROOT=$demo XDG_CONFIG_HOME=$demo/home/.config XDG_RUNTIME_DIR=$demo/run HOME=$demo/home

"$bin/wyx-simulator" --seed 11 --rate 40 --duration 120 >/dev/null &
simulator=$!
sleep 20  # a log with failures to show

xvfb-run -a -s "-screen 0 1024x768x24" bash -c '
    "$1/WyxProgress" & app=$!
    win=$(xdotool search --sync --onlyvisible --pid $app | head -n 1)
    sleep 6
    eval "$(xdotool getwindowgeometry --shell "$win")"
    shot() { import -window root -crop "${WIDTH}x${HEIGHT}+${X}+${Y}" +repage "$1"; }
    shot "$2/status-tab.png"
    # The Log tab, its error log, and the first failed job.
    xdotool mousemove --window "$win" 130 20 click 1; sleep 1
    xdotool mousemove --window "$win" 395 61 click 1; sleep 1
    xdotool mousemove --window "$win" 200 126 click 1; sleep 1
    shot "$2/log-tab.png"
    kill $app; wait $app || true' _ "$bin" "$here"
echo "$here/status-tab.png $here/log-tab.png"
