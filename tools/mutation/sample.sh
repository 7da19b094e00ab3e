#!/bin/bash
# The fixed mutation samples the test suite is measured with: 40 changes per area, seed 15, made by
# ../shared/tools/mutants.py in a configured and built normal build folder of the given checkout.
# usage: tools/mutation/sample.sh CHECKOUT OUTPUT-PREFIX AREA...   (areas: pump list os data)
# The binaries are today's; the measurement before the suite was consolidated also ran log_icon_setting_tests.
set -u
checkout=$1 out=$2; shift 2
here=$(cd "$(dirname "$0")" && pwd)
tool=${MUTANTS:-$(cd "$here/../.." && pwd)/../shared/tools/mutants.py}
run="$here/run-tests.sh"
unit="notify_tests pump_tests status_model_tests log_folder_error_tests status_format_tests status_datasource_tests"
unit+=" app_platform_tests language_tests log_rows_tests status_rows_tests automation_query_tests"
unit+=" listctrl_selection_tests status_simulator_tests log_model_tests journal_tests"
unit=${UNIT_BINARIES:-$unit}
pump=${PUMP_BINARIES:-"pump_tests notify_tests status_model_tests status_simulator_tests log_model_tests"}
list=${LIST_BINARIES:-"listctrl_selection_tests listctrl_tests controls_widgets_test automation_accessible_tests"}
targets() { for t in "$@"; do printf -- ' --target %s' "$t"; done; }
cd "$checkout" || exit 1
common="--build build --max 40 --seed 15"
for area in "$@"; do
    case $area in
    pump) python3 "$tool" $common --timeout 75 $(targets $pump) --ctest "-N >/dev/null 2>&1; $run $pump" pump/*.cpp ;;
    list) python3 "$tool" $common --timeout 75 $(targets $list) --ctest "-N >/dev/null 2>&1; $run --display $list" \
              components/Utility/*.cpp ;;
    os) python3 "$tool" $common --timeout 120 --target wyx_os --ctest "-N >/dev/null 2>&1; $run $unit" platform/os/*.cpp ;;
    data) python3 "$tool" $common --timeout 120 $(targets $unit) --ctest "-N >/dev/null 2>&1; $run $unit" data/*.cpp ;;
    *) echo "unknown area: $area" >&2; exit 2 ;;
    esac > "$out-$area.log" 2>&1
done
