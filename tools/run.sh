#!/usr/bin/env bash
# Installs what is missing, builds, and runs the program against the simulated instrument:
# zx917-sim on a pseudo-terminal, a demo download file of our own records, and a whole
# download with its progress line, ending with the simulator's verdict.
#   tools/run.sh [--demo]
set -euo pipefail
zx917_root="$(cd "$(dirname "$0")/.." && pwd)"
source "$zx917_root/tools/deps.sh"
ensure_deps
build_project "$zx917_root/build"
bin="$zx917_root/build/tools"
demo="$(mktemp -d)"
sim_pid=""
cleanup() {
    [ -n "$sim_pid" ] && kill "$sim_pid" 2>/dev/null && wait "$sim_pid" 2>/dev/null || true
    rm -rf "$demo"
}
trap cleanup EXIT

echo "The wizard is not built yet: the demo runs the same download with zx917-download."
"$bin/zx917-mkfile" --revision A.02.00 --bytes 60000 "$demo/DEMO.HEX"
"$bin/zx917-download" check "$demo/DEMO.HEX"
"$bin/zx917-sim" --link "$demo/COM1" --revision A.01.02 --line-rate --program-delay 1500 \
    --once --expect "$demo/DEMO.HEX" --report "$demo/report.json" 2>/dev/null &
sim_pid=$!
for _ in $(seq 50); do [ -e "$demo/COM1" ] && break; sleep 0.05; done
status=0
"$bin/zx917-download" download --port "$demo/COM1" --file "$demo/DEMO.HEX" --yes || status=$?
for _ in $(seq 40); do kill -0 "$sim_pid" 2>/dev/null || break; sleep 0.05; done
kill "$sim_pid" 2>/dev/null || true
wait "$sim_pid" 2>/dev/null || true
sim_pid=""
echo "Simulator's verdict: $(grep -o '"verdict": "[a-z]*"' "$demo/report.json" | cut -d'"' -f4)"
exit $status
