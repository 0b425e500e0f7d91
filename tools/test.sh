#!/usr/bin/env bash
# Installs what is missing, builds everything and runs every test with ctest.
#   tools/test.sh              the normal build and its tests
#   tools/test.sh --sanitize   the whole suite built with AddressSanitizer and UBSan
#   tools/test.sh --all        the sanitized suite without the windows, each fuzz target for
#                              20 s, then the normal suite (CI runs this when CI=true)
set -euo pipefail
zx917_root="$(cd "$(dirname "$0")/.." && pwd)"
source "$zx917_root/tools/deps.sh"
zx917_packages+=("${zx917_package_tools[@]}")
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
# The quick sanitized suite (CI's) leaves out the windows too: their Qt-heavy build would take
# CI's time, and the code of theirs that reads files and clips runs in the core tests.
sanitized() {
    local skip=() options=(-DZX917_SANITIZE=ON)
    if [ "${1:-}" = quick ]; then
        skip=(-E e2e_fault_matrix)
        options+=(-DZX917_WINDOWS=OFF)
    fi
    ASAN_OPTIONS="detect_leaks=1:abort_on_error=1" UBSAN_OPTIONS="print_stacktrace=1:halt_on_error=1" \
        run_suite "$zx917_root/build-sanitize" ${skip[@]+"${skip[@]}"} -- "${options[@]}"
}

case "$mode" in
--sanitize)
    sanitized
    ;;
--all)
    sanitized quick
    bash "$zx917_root/tests/fuzz/run_fuzz.sh" 20
    run_suite "$zx917_root/build"  # last, so that its summary closes the run
    ;;
*)
    run_suite "$zx917_root/build"
    ;;
esac
