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

run_suite() {
    local dir="$1"
    shift
    build_project "$dir" "$@"
    (cd "$dir" && ctest --output-on-failure -j2 --timeout 900)
}

sanitized() {
    ASAN_OPTIONS="detect_leaks=1:abort_on_error=1" UBSAN_OPTIONS="print_stacktrace=1:halt_on_error=1" \
        run_suite "$zx917_root/build-sanitize" -DZX917_SANITIZE=ON
}

case "$mode" in
--sanitize)
    sanitized
    ;;
--all)
    sanitized
    bash "$zx917_root/tests/fuzz/run_fuzz.sh" 60
    run_suite "$zx917_root/build"  # last, so that its summary closes the run
    ;;
*)
    run_suite "$zx917_root/build"
    ;;
esac
