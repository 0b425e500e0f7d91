#!/usr/bin/env bash
# Installs what is missing, builds everything and runs every test with ctest.
set -euo pipefail
zx917_root="$(cd "$(dirname "$0")/.." && pwd)"
source "$zx917_root/tools/deps.sh"
ensure_deps
build_project "$zx917_root/build"
cd "$zx917_root/build"
ctest --output-on-failure -j2 --timeout 600
