#!/usr/bin/env bash
# Installs what is missing, builds, and starts the wizard ZX917A.
#   tools/run.sh          the wizard for real ports (Com1/Com2: $ZX917_COM1/$ZX917_COM2, else
#                         the system's serial ports, USB and ACM adapters first)
#   tools/run.sh --demo   the wizard against the simulated instrument: zx917-sim on a
#                         pseudo-terminal at the real line rate, a demo download file in "HEX"
# Without a display the demo runs the same download with the command-line front end.
set -euo pipefail
zx917_root="$(cd "$(dirname "$0")/.." && pwd)"
source "$zx917_root/tools/deps.sh"
ensure_deps
build_project "$zx917_root/build"
bin="$zx917_root/build/tools"
program="$zx917_root/build/program"

if [ "${1:-}" != "--demo" ]; then
    exec "$program/ZX917A" "$@"
fi

demo="$(mktemp -d)"
sim_pid=""
cleanup() {
    [ -n "$sim_pid" ] && kill "$sim_pid" 2>/dev/null && wait "$sim_pid" 2>/dev/null || true
    rm -rf "$demo"
}
trap cleanup EXIT

mkdir -p "$program/HEX"
"$bin/zx917-mkfile" --revision A.02.00 --bytes 60000 "$program/HEX/DEMO.HEX"
"$bin/zx917-sim" --link "$demo/COM1" --revision A.01.02 --line-rate --program-delay 1500 \
    --expect "$program/HEX/DEMO.HEX" --report "$demo/report.json" 2>/dev/null &
sim_pid=$!
for _ in $(seq 50); do [ -e "$demo/COM1" ] && break; sleep 0.05; done

if [ -z "${DISPLAY:-}" ] && [ -z "${WAYLAND_DISPLAY:-}" ]; then
    echo "No display (DISPLAY and WAYLAND_DISPLAY unset): running the same download with zx917-download."
    "$bin/zx917-download" check "$program/HEX/DEMO.HEX"
    status=0
    "$bin/zx917-download" download --port "$demo/COM1" --file "$program/HEX/DEMO.HEX" --yes ||
        status=$?
else
    echo "The wizard talks to the simulated ZX917 (revision A.01.02) on Com1 = $demo/COM1."
    echo "Next, Next, select HEX/DEMO.HEX, Next, Execute: about two minutes at 38400 baud."
    status=0
    ZX917_COM1="$demo/COM1" "$program/ZX917A" || status=$?
fi
kill "$sim_pid" 2>/dev/null || true
wait "$sim_pid" 2>/dev/null || true
sim_pid=""
[ -s "$demo/report.json" ] &&
    echo "Simulator's verdict: $(grep -o '"verdict": "[a-z]*"' "$demo/report.json" | cut -d'"' -f4)"
exit $status
