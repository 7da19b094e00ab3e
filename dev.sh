#!/usr/bin/env bash
# The two set-up commands of the README (Debian 12, run as root or with sudo):
#   ./dev.sh run    install what is missing, build, start the program on a live demo
#   ./dev.sh test   install what is missing, build, run every test (also under the sanitizers)
#   WYX_DEMO_LANG=de_DE ./dev.sh run    the demo in one of the program's languages
#   WYX_DEMO_KEEP=1 ./dev.sh run        keep the demo's temporary system root afterwards
set -euo pipefail
cd "$(dirname "$0")"
ROOT=$PWD

PACKAGES=(cmake ninja-build g++ clang libclang-rt-14-dev pkg-config libwxgtk3.2-dev
          libpango1.0-dev libcairo2-dev googletest libgtest-dev libbenchmark-dev libx11-dev xvfb xauth x11-utils xdotool imagemagick
          locales-all fonts-dejavu-core util-linux gettext wx3.2-i18n
          libgtk-3-dev libatk1.0-dev at-spi2-core dbus-daemon gir1.2-atspi-2.0 python3-gi
          dpkg-dev file desktop-file-utils)

install_missing() {
    local missing=() p
    for p in "${PACKAGES[@]}"; do
        dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q 'install ok installed' || missing+=("$p")
    done
    [ ${#missing[@]} -eq 0 ] && return 0
    local sudo=""
    [ "$(id -u)" -eq 0 ] || sudo=sudo
    echo "== installing: ${missing[*]}"
    $sudo apt-get update -qq
    DEBIAN_FRONTEND=noninteractive $sudo apt-get install -y -qq "${missing[@]}" >/dev/null
}

JOBS=$(nproc)

# configure_and_build DIR [cmake options...]
configure_and_build() {
    local dir=$1; shift
    echo "== building $dir"
    cmake -S "$ROOT" -B "$ROOT/$dir" -G Ninja "$@" >/dev/null
    cmake --build "$ROOT/$dir" -j "$JOBS"
}

# Runs a command on the current display, or on a virtual one when there is none.
on_display() {
    if [ -n "${DISPLAY:-}" ]; then "$@"; else xvfb-run -a -s "-screen 0 1280x1024x24" "$@"; fi
}

TOTAL_PASSED=0
TOTAL_FAILED=0
# run_ctest LABEL DIR [ctest options...]: runs and tallies one suite.
run_ctest() {
    local label=$1 dir=$2; shift 2
    local log="$ROOT/$dir/ctest-summary.log" status=0
    echo "== tests: $label"
    (cd "$ROOT/$dir" && on_display ${RUNNER:-} ctest --output-on-failure -j "$JOBS" "$@") 2>&1 | tee "$log" || status=1
    local line total failed
    line=$(grep -E 'tests passed, [0-9]+ tests? failed out of [0-9]+' "$log" | tail -n 1 || true)
    if [ -z "$line" ]; then
        echo "== $label: no test summary (ctest did not run)"
        TOTAL_FAILED=$((TOTAL_FAILED + 1))
        return
    fi
    total=$(sed -E 's/.*out of ([0-9]+).*/\1/' <<<"$line")
    failed=$(sed -E 's/.*, ([0-9]+) tests? failed.*/\1/' <<<"$line")
    TOTAL_PASSED=$((TOTAL_PASSED + total - failed))
    TOTAL_FAILED=$((TOTAL_FAILED + failed))
    [ "$status" -eq 0 ] || [ "$failed" -gt 0 ] || TOTAL_FAILED=$((TOTAL_FAILED + 1))
}

cmd_test() {
    install_missing
    configure_and_build build -DCMAKE_BUILD_TYPE=RelWithDebInfo
    configure_and_build build-tsan -DCMAKE_CXX_COMPILER=clang++ -DWYX_GUI=OFF -DWYX_SANITIZE=thread
    configure_and_build build-asan -DCMAKE_CXX_COMPILER=clang++ -DWYX_GUI=OFF -DWYX_SANITIZE=address -DWYX_FUZZ=ON

    export TSAN_OPTIONS="halt_on_error=1 second_deadlock_stack=1"
    export ASAN_OPTIONS="detect_leaks=1 abort_on_error=1"
    export UBSAN_OPTIONS="print_stacktrace=1 halt_on_error=1"
    export LSAN_OPTIONS="suppressions=$ROOT/tests/support/lsan.supp print_suppressions=0"

    run_ctest "all tests" build
    # Some kernels randomise addresses more than ThreadSanitizer allows; setarch -R turns
    # that off for the run, where the system lets us.
    local norandom=""
    setarch "$(uname -m)" -R true 2>/dev/null && norandom="setarch $(uname -m) -R"
    RUNNER=$norandom run_ctest "ThreadSanitizer" build-tsan -L unit
    run_ctest "AddressSanitizer + UBSan, fuzzing" build-asan -L "unit|fuzz"

    echo "ctest: $TOTAL_PASSED passed, $TOTAL_FAILED failed"
    [ "$TOTAL_FAILED" -eq 0 ]
}

SIMULATOR=""
DEMO=""
end_demo() {
    if [ -n "$SIMULATOR" ]; then
        kill "$SIMULATOR" 2>/dev/null || true
        wait "$SIMULATOR" 2>/dev/null || true
    fi
    [ -n "$DEMO" ] && [ -d "$DEMO" ] || return 0
    if [ "${WYX_DEMO_KEEP:-0}" = 1 ]; then
        echo "== demo data kept in $DEMO"
    else
        rm -rf -- "$DEMO"
    fi
}

# Names the build's folder as the demo's install folder, so that the program
# finds its catalogs (LocalizedStrings) there. With WYX_DEMO_LANG (a code of the
# per-user language file, e.g. de_DE) the demo runs a copy of the program whose
# own WyxConfig.cfg says version 3.3, the version that lets that file decide,
# and writes the file; the build's configuration stays as it is for everyone
# else. Prints the folder of the program to run.
prepare_demo_language() {
    local demo=$1 bin=$2
    mkdir -p "$demo/etc/kelvo"
    printf '[SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve]\nInstallPath=%s\n' "$bin" >"$demo/etc/kelvo/registry.ini"
    if [ -z "${WYX_DEMO_LANG:-}" ]; then
        echo "$bin"
        return
    fi
    local copy="$demo/opt/wyxprogress"
    mkdir -p "$copy" "$XDG_CONFIG_HOME/Corvane Quillet"
    cp "$bin/WyxProgress" "$bin"/*.so "$bin/wyx_folder.ico" "$copy/"
    cat >"$copy/WyxConfig.cfg" <<'CONFIG'
<?xml version="1.0" encoding="UTF-8"?>
<Configuration>
  <WyxConfiguration>
    <Entry key="APP_WYX_VERSION" value="3.3"/>
    <Entry key="ICON_SHELL_NOTIFY" value="0"/>
  </WyxConfiguration>
</Configuration>
CONFIG
    printf '%s\n' "$WYX_DEMO_LANG" >"$XDG_CONFIG_HOME/Corvane Quillet/current.lang"
    echo "$copy"
}

# What the demo runs: the program (with its libraries, configuration and
# icon), its catalogs, the service simulator and wyx-journal to look at the
# journals. The tests and benchmarks are left for ./dev.sh test.
DEMO_TARGETS=(WyxProgress wyx_catalogs wyx-simulator wyx-journal)

cmd_run() {
    install_missing
    echo "== building build (the demo's programs)"
    cmake -S "$ROOT" -B "$ROOT/build" -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
    cmake --build "$ROOT/build" -j "$JOBS" --target "${DEMO_TARGETS[@]}"
    local bin="$ROOT/build/bin"
    DEMO=$(mktemp -d /tmp/wyx-demo.XXXXXX)
    # The simulator and the demo's folder go when the demo ends, however it
    # ends; WYX_DEMO_KEEP=1 keeps the folder to look at afterwards.
    trap end_demo EXIT
    trap 'exit 130' INT TERM
    local demo=$DEMO
    export WYX_SYSTEM_ROOT=$demo
    export XDG_CONFIG_HOME=$demo/home/.config XDG_RUNTIME_DIR=$demo/run
    mkdir -p "$XDG_CONFIG_HOME" "$XDG_RUNTIME_DIR" && chmod 700 "$XDG_RUNTIME_DIR"
    echo "== demo data in $demo (WYX_SYSTEM_ROOT)"
    local program
    program=$(prepare_demo_language "$demo" "$bin")
    [ -z "${WYX_DEMO_LANG:-}" ] || echo "== language $WYX_DEMO_LANG: program copy in $program, version 3.3"
    "$bin/wyx-simulator" --duration 3600 &
    SIMULATOR=$!
    sleep 1
    if [ -n "${DISPLAY:-}" ]; then
        "$program/WyxProgress"
    else
        local shot="$ROOT/out/screenshot.png"
        mkdir -p "$ROOT/out"
        echo "== no display: running on a virtual one for 8 seconds"
        xvfb-run -a -s "-screen 0 1024x768x24" bash -c '
            "$1" & app=$!
            sleep 8
            window=$(xdotool search --onlyvisible --pid $app | head -n 1)
            import -window "${window:-root}" "$2"
            kill $app; wait $app || true' _ "$program/WyxProgress" "$shot"
        echo "== screenshot of the window: $shot"
    fi
}

case "${1:-}" in
    run) cmd_run ;;
    test) cmd_test ;;
    *) echo "usage: $0 run|test" >&2; exit 2 ;;
esac
