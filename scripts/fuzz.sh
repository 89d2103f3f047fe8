#!/usr/bin/env bash
# Builds the libFuzzer targets with clang into build-fuzz/ (or $BUILD_DIR) and
# runs each for a bounded time on its seed corpus from tests/fuzz/<target>/corpus.
# A crash, a leak, a sanitizer report, a timeout or a failed check fails the run;
# the input that did it lands in $BUILD_DIR/fuzz-findings/ with the command
# that reproduces it.
#
#   FUZZ_SECONDS  seconds for each target (default 45)
#   FUZZ_JOBS     targets run side by side (default: the number of cores)
#   FUZZ_TARGETS  names to run (default: all)
set -euo pipefail
root=$(cd "$(dirname "$0")/.." && pwd)
build=${BUILD_DIR:-$root/build-fuzz}
seconds=${FUZZ_SECONDS:-45}
jobs=${FUZZ_JOBS:-$(nproc)}
targets=${FUZZ_TARGETS:-"specification_string sheet_list format_check time_cells template_loading workbook_open workbook_parts xls_reader ods_reader text_reader series_csv series_json"}

# clang and its fuzzer runtime are needed here only, so they are installed here.
if ! command -v clang++ >/dev/null || ! echo 'extern "C" int LLVMFuzzerTestOneInput(const char *, unsigned long) { return 0; }' |
        clang++ -x c++ -fsanitize=fuzzer - -o /dev/null 2>/dev/null; then
    sudo_cmd=""
    [ "$(id -u)" -eq 0 ] || sudo_cmd="sudo"
    DEBIAN_FRONTEND=noninteractive $sudo_cmd apt-get install -y -qq --no-install-recommends clang libclang-rt-14-dev >/dev/null
fi

start=$(date +%s)
CC=clang CXX=clang++ cmake -S "$root" -B "$build" -DVANTREL_FUZZ=ON -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
cmake --build "$build" -j"$(nproc)" --target fuzzers
built=$(date +%s)

export ASAN_OPTIONS=${ASAN_OPTIONS:-detect_leaks=1:allocator_may_return_null=0}
export UBSAN_OPTIONS=${UBSAN_OPTIONS:-halt_on_error=1:print_stacktrace=1}
findings=$build/fuzz-findings
rm -rf "$findings"
mkdir -p "$findings"

# Runs one target; new inputs go to a scratch corpus, the committed seeds stay as they are.
run_target() {
    local name=$1
    local program=$build/bin/${name}_fuzzer
    local scratch=$build/fuzz-corpus/$name
    mkdir -p "$scratch"
    if "$program" -max_total_time="$seconds" -timeout=20 -rss_limit_mb=2560 -print_final_stats=1 \
        -artifact_prefix="$findings/$name-" "$scratch" "$root/tests/fuzz/$name/corpus" \
        >"$findings/$name.log" 2>&1; then
        echo "$name: $(grep -o 'stat::number_of_executed_units: *[0-9]*' "$findings/$name.log" | grep -o '[0-9]*$') runs, nothing found"
    else
        echo "$name: FINDING (log: $findings/$name.log)"
        grep -E 'ERROR|fuzz check failed|SUMMARY|Test unit written' "$findings/$name.log" | head -n 8
        for input in "$findings/$name"-*; do
            [ -f "$input" ] && echo "  reproduce: $program $input"
        done
        return 1
    fi
}

failed=0
running=0
pids=()
for name in $targets; do
    run_target "$name" &
    pids+=($!)
    running=$((running + 1))
    if [ "$running" -ge "$jobs" ]; then
        wait -n || failed=1
        running=$((running - 1))
    fi
done
while [ "$running" -gt 0 ]; do
    wait -n || failed=1
    running=$((running - 1))
done
finished=$(date +%s)
echo "fuzz build: $((built - start)) s, fuzzing: $((finished - built)) s"
exit $failed
