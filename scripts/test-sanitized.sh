#!/usr/bin/env bash
# Builds everything with AddressSanitizer and UndefinedBehaviorSanitizer into
# build-asan/ (or $BUILD_DIR) and runs every test there. Any sanitizer report,
# a leak included, fails the run.
set -euo pipefail
root=$(cd "$(dirname "$0")/.." && pwd)
build=${BUILD_DIR:-$root/build-asan}
jobs=${JOBS:-$(nproc)}

export ASAN_OPTIONS=${ASAN_OPTIONS:-halt_on_error=1:abort_on_error=0:detect_leaks=1:strict_string_checks=1:detect_stack_use_after_return=1:check_initialization_order=1}
export UBSAN_OPTIONS=${UBSAN_OPTIONS:-halt_on_error=1:print_stacktrace=1}

start=$(date +%s)
# At -O1, as the sanitizers like it; the suite then also runs at a second
# optimisation level (the module's exports, for one, differ between levels).
cmake -S "$root" -B "$build" -DCMAKE_BUILD_TYPE=RelWithDebInfo -DVANTREL_SANITIZE=ON \
    -DCMAKE_C_FLAGS_RELWITHDEBINFO="-O1 -g -DNDEBUG" -DCMAKE_CXX_FLAGS_RELWITHDEBINFO="-O1 -g -DNDEBUG" >/dev/null
cmake --build "$build" -j"$jobs"
built=$(date +%s)
status=0
ctest --test-dir "$build" --output-on-failure -j"$jobs" || status=$?
done_at=$(date +%s)
echo "sanitized build: $((built - start)) s, tests: $((done_at - built)) s"
exit $status
