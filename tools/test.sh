#!/usr/bin/env bash
# Installs what is missing, builds everything and runs every test with ctest.
#   tools/test.sh              the normal build
#   tools/test.sh --sanitize   the whole suite built with AddressSanitizer and UBSan
set -euo pipefail
zx917_root="$(cd "$(dirname "$0")/.." && pwd)"
source "$zx917_root/tools/deps.sh"
ensure_deps
dir="$zx917_root/build"
flags=()
if [ "${1:-}" = "--sanitize" ]; then
    dir="$zx917_root/build-sanitize"
    flags=(-DZX917_SANITIZE=ON)
    export ASAN_OPTIONS="detect_leaks=1:abort_on_error=1"
    export UBSAN_OPTIONS="print_stacktrace=1:halt_on_error=1"
fi
build_project "$dir" "${flags[@]}"
cd "$dir"
ctest --output-on-failure -j2 --timeout 600
