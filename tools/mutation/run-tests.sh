#!/bin/bash
# Runs whole test binaries from the current build folder, one process each, and stops at the first
# failure: much cheaper than one process per test, which is what makes a mutation sample affordable.
# Tests named in ALONE (a colon-separated list; none today) change process-wide state and run in a
# process of their own; the producer soak is left to ctest.
# A binary that runs past LIMIT seconds is ended (a change that makes a test hang counts as caught), so
# that no hung test process outlives the run.
# usage: run-tests.sh [--display] binary...
if [ "$1" = --display ]; then
    shift
    exec xvfb-run -a -s '-screen 0 1280x1024x24' "$0" "$@"
fi
ALONE=${ALONE-}
LIMIT=${LIMIT:-60}
for b in "$@"; do
    timeout -k 5 "$LIMIT" ./bin/$b --gtest_filter="-*BesideAProducerProcess*:$ALONE" >/dev/null 2>&1 ||
        { echo "failed: $b"; exit 1; }
    for t in ${ALONE//:/ }; do
        timeout -k 5 "$LIMIT" ./bin/$b --gtest_filter="$t" >/dev/null 2>&1 || { echo "failed: $b $t"; exit 1; }
    done
done
