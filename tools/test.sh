#!/usr/bin/env bash
# Installs what is missing, builds everything and runs every test with ctest.
#   tools/test.sh              the normal build and its tests
#   tools/test.sh --sanitize   the whole suite built with AddressSanitizer and UBSan
#   tools/test.sh --all        both, and each fuzz target for 60 s (CI runs this when CI=true)
set -euo pipefail
zx917_root="$(cd "$(dirname "$0")/.." && pwd)"
source "$zx917_root/tools/deps.sh"
ensure_deps
mode="${1:-}"
[ "${CI:-}" = "true" ] && [ -z "$mode" ] && mode="--all"

# run_suite DIR [ctest options] [-- cmake options]
run_suite() {
    local dir="$1"
    shift
    local ctest_args=() cmake_args=()
    while [ $# -gt 0 ] && [ "$1" != "--" ]; do ctest_args+=("$1"); shift; done
    [ $# -gt 0 ] && shift && cmake_args=("$@")
    build_project "$dir" ${cmake_args[@]+"${cmake_args[@]}"}
    (cd "$dir" && ctest --output-on-failure -j2 --timeout 900 ${ctest_args[@]+"${ctest_args[@]}"})
}

# The fault matrix runs in the normal suite; under the sanitizers it would only take longer.
sanitized() {
    local skip=()
    [ "${1:-}" = quick ] && skip=(-E e2e_fault_matrix)
    ASAN_OPTIONS="detect_leaks=1:abort_on_error=1" UBSAN_OPTIONS="print_stacktrace=1:halt_on_error=1" \
        run_suite "$zx917_root/build-sanitize" ${skip[@]+"${skip[@]}"} -- -DZX917_SANITIZE=ON
}

case "$mode" in
--sanitize)
    sanitized
    ;;
--all)
    sanitized quick
    bash "$zx917_root/tests/fuzz/run_fuzz.sh" 60
    run_suite "$zx917_root/build"  # last, so that its summary closes the run
    ;;
*)
    run_suite "$zx917_root/build"
    ;;
esac
