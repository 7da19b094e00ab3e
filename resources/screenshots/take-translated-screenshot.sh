#!/usr/bin/env bash
# Retakes the README's picture of the window in another language from a real run
# of the demo: the program set to version 3.3 with a per-user language file,
# beside the service simulator on a virtual display, its Status tab after a few
# seconds of jobs (status-tab-<language>.png).
#   resources/screenshots/take-translated-screenshot.sh [language, default de_DE] [build folder, default build]
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
language=${1:-de_DE}
bin=$(cd "${2:-$here/../../build}" && pwd)/bin
demo=$(mktemp -d /tmp/wyx-shot.XXXXXX)
simulator=
cleanup() {
    [ -n "$simulator" ] && kill "$simulator" 2>/dev/null && wait "$simulator" 2>/dev/null
    rm -rf "$demo"
}
trap cleanup EXIT
mkdir -p "$demo/home/.config/Corvane Quillet" "$demo/run" "$demo/etc/kelvo" "$demo/program" && chmod 700 "$demo/run"
export WYX_SYSTEM_ROOT=$demo XDG_CONFIG_HOME=$demo/home/.config XDG_RUNTIME_DIR=$demo/run HOME=$demo/home

# A copy of the program with a configuration of its own (version 3.3: the user's
# file decides), the catalogs where the build put them, and the user's file.
cp "$bin/WyxProgress" "$bin"/*.so "$bin/wyx_folder.ico" "$demo/program/"
printf '%s\n' '<?xml version="1.0" encoding="UTF-8"?>' '<Configuration>' '  <WyxConfiguration>' \
    '    <Entry key="APP_WYX_VERSION" value="3.3"/>' '  </WyxConfiguration>' '</Configuration>' \
    >"$demo/program/WyxConfig.cfg"
printf '[SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve]\nInstallPath=%s\n' "$bin" >"$demo/etc/kelvo/registry.ini"
printf '%s\n' "$language" >"$demo/home/.config/Corvane Quillet/current.lang"

"$bin/wyx-simulator" --seed 11 --rate 40 --duration 120 >/dev/null &
simulator=$!
sleep 20 # jobs in every state

xvfb-run -a -s "-screen 0 1024x768x24" bash -c '
    "$1/WyxProgress" & app=$!
    win=$(xdotool search --sync --onlyvisible --pid $app | head -n 1)
    sleep 6
    eval "$(xdotool getwindowgeometry --shell "$win")"
    import -window root -crop "${WIDTH}x${HEIGHT}+${X}+${Y}" +repage "$2"
    kill $app; wait $app || true' _ "$demo/program" "$here/status-tab-$language.png"
echo "$here/status-tab-$language.png"
