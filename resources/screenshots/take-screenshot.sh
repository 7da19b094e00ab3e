#!/usr/bin/env bash
# Retakes main-window.png: starts the built program on an empty demo folder on a
# virtual display and photographs its window.
#   resources/screenshots/take-screenshot.sh [build folder, default build]
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
bin=$(cd "${1:-$here/../../build}" && pwd)/bin
demo=$(mktemp -d /tmp/wyx-shot.XXXXXX)
trap 'rm -rf "$demo"' EXIT
mkdir -p "$demo/home/.config" "$demo/run" && chmod 700 "$demo/run"

WYX_SYSTEM_ROOT=$demo XDG_CONFIG_HOME=$demo/home/.config XDG_RUNTIME_DIR=$demo/run \
xvfb-run -a -s "-screen 0 1024x768x24" bash -c '
    "$1/WyxProgress" & app=$!
    win=$(xdotool search --sync --onlyvisible --pid $app | head -n 1)
    sleep 2  # let the first polls fill the tables
    eval "$(xdotool getwindowgeometry --shell "$win")"
    import -window root -crop "${WIDTH}x${HEIGHT}+${X}+${Y}" +repage "$2"
    kill $app; wait $app || true' _ "$bin" "$here/main-window.png"
echo "$here/main-window.png"
