#!/usr/bin/env bash
# Installs what is missing, builds, and runs the program.
#   tools/run.sh          check a demo download file of our own records
#   tools/run.sh --demo   the same demo
set -euo pipefail
zx917_root="$(cd "$(dirname "$0")/.." && pwd)"
source "$zx917_root/tools/deps.sh"
ensure_deps
build_project "$zx917_root/build"
bin="$zx917_root/build/tools"
demo="$(mktemp -d)"
trap 'rm -rf "$demo"' EXIT
"$bin/zx917-mkfile" --revision A.02.00 --bytes 60000 "$demo/DEMO.HEX"
echo "The wizard is not built yet: checking a demo download file with 'zx917-download check'."
"$bin/zx917-download" check "$demo/DEMO.HEX"
