#!/usr/bin/env bash
# Benchmarks of the download program, each printed as a figure measured in this run:
#  (a) transfer without line-rate emulation: records per second, program CPU seconds per MB
#  (b) transfer at the emulated line rate (38400 8E1): wall time / ideal stop-and-wait time,
#      and the program's CPU time as a share of the wall time
#  (c) the download-file check of a 100 MB file against a 100 KB file, as a ratio
#  (d) the program's CPU share while it waits 54 s for a silent instrument
#  (e) the same download at the emulated line rate by the command line and by the wizard window
#      (driven by clicks, offscreen without a display): wall time / ideal, and CPU share
#  (f) what recording a download in the service record costs, on a new record and on one of
#      2000 attempts, against the 50 ms it may add
# Usage: bench/bench.sh [--quick | PARTS]   (--quick: a, b and c; PARTS: letters, e.g. "de")
set -euo pipefail
zx917_root="$(cd "$(dirname "$0")/.." && pwd)"
source "$zx917_root/tools/deps.sh"
ensure_deps
build_project "$zx917_root/build" >/dev/null
bin="$zx917_root/build/tools"
work="$(mktemp -d)"
sim_pid=""
cleanup() {
    [ -n "$sim_pid" ] && kill "$sim_pid" 2>/dev/null || true
    rm -rf "$work"
}
trap cleanup EXIT
export ZX917_HISTORY="$work/history.sqlite"  # the benchmarks' downloads stay out of the user's

parts="abcdef"
[ "${1:-}" = "--quick" ] && parts="abc"
[ -n "${1:-}" ] && [ "${1:-}" != "--quick" ] && parts="$1"
part() { [[ "$parts" == *"$1"* ]]; }

json() { python3 -c "import json,sys; d=json.load(open('$1')); print($2)"; }

# Runs a download against the simulator; prints "wall user sys" of the program.
run_download() {
    rm -f "$work/com1" "$work/report.json"
    "$bin/zx917-sim" --link "$work/com1" --once --expect "$work/BIG.HEX" \
        --report "$work/report.json" "$@" 2>/dev/null &
    sim_pid=$!
    for _ in $(seq 50); do [ -e "$work/com1" ] && break; sleep 0.05; done
    /usr/bin/env time -f "%e %U %S" -o "$work/time" "$bin/zx917-download" download \
        --port "$work/com1" --file "$work/BIG.HEX" --yes >/dev/null 2>"$work/err"
    for _ in $(seq 100); do kill -0 "$sim_pid" 2>/dev/null || break; sleep 0.05; done
    sim_pid=""
    [ "$(json "$work/report.json" "d['verdict']")" = success ] || { cat "$work/err"; exit 1; }
    cat "$work/time"
}

"$bin/zx917-mkfile" --bytes 1500000 "$work/BIG.HEX" >/dev/null
mb=$(python3 -c "import os; print(os.path.getsize('$work/BIG.HEX')/1e6)")

if part a; then
echo "(a) no line-rate emulation, $mb MB of records"
read -r wall user sys < <(run_download --answer-delay 0 --open-delay 0 --program-delay 0)
python3 - "$work/report.json" "$user" "$sys" "$mb" <<'PY'
import json, sys
d = json.load(open(sys.argv[1])); t = d["transfer"]
records = sum(d["records"].values())
cpu = float(sys.argv[2]) + float(sys.argv[3])
print(f"    records per second: {records / (t['ms'] / 1000):.0f}  ({records} records in {t['ms']} ms)")
print(f"    program CPU seconds per MB: {cpu / float(sys.argv[4]):.3f}")
PY
fi

if part b; then
echo "(b) emulated line rate 38400 baud 8E1"
read -r wall user sys < <(run_download --line-rate --answer-delay 0 --program-delay 500)
python3 - "$work/report.json" "$wall" "$user" "$sys" <<'PY'
import json, sys
d = json.load(open(sys.argv[1])); t = d["transfer"]
ideal_ms = (t["bytes_in"] + t["bytes_out"]) * 11 / 38400 * 1000 + t["delays_ms"]
wall, cpu = float(sys.argv[2]), float(sys.argv[3]) + float(sys.argv[4])
print(f"    transfer {t['ms']} ms, ideal {ideal_ms:.0f} ms: ratio {t['ms'] / ideal_ms:.3f}")
print(f"    program CPU share of wall time: {100 * cpu / wall:.2f} %")
PY
fi

if part c; then
echo "(c) file check, 100 MB against 100 KB"
"$bin/zx917-mkfile" --bytes 100000 "$work/SMALL.HEX" >/dev/null
"$bin/zx917-mkfile" --bytes 100000000 "$work/HUGE.HEX" >/dev/null
"$zx917_root/build/bench/zx917-check-bench" "$work/SMALL.HEX" "$work/HUGE.HEX" >"$work/check"
python3 - "$work/check" <<'PY'
import sys
rows = [l.split() for l in open(sys.argv[1])]
small, huge = float(rows[0][2]), float(rows[1][2])
assert rows[0][1] == rows[1][1] == "1", "a file failed its check"
print(f"    {small * 1e6:.1f} us against {huge * 1e6:.1f} us: ratio {huge / small:.2f}")
PY
rm -f "$work/HUGE.HEX"
fi

if part d; then
    echo "(d) waiting for a silent instrument"
    rm -f "$work/com1"
    "$bin/zx917-sim" --link "$work/com1" --fault silent:MAINTENANCE:DOWNLOAD >/dev/null 2>&1 &
    sim_pid=$!
    for _ in $(seq 50); do [ -e "$work/com1" ] && break; sleep 0.05; done
    /usr/bin/env time -f "%e %U %S" -o "$work/time" "$bin/zx917-download" identify \
        --port "$work/com1" >/dev/null 2>&1 || true
    kill "$sim_pid" 2>/dev/null || true
    sim_pid=""
    # time writes "Command exited with non-zero status 1" first: the figures are the last line.
    read -r wall user sys < <(tail -1 "$work/time")
    python3 -c "print(f'    {float($user)+float($sys):.2f} s CPU in {float($wall):.1f} s: {100*(float($user)+float($sys))/float($wall):.3f} %')"
fi

if part e; then
    # The window and the command line on the same file, one after the other, so that both meet
    # the same machine: the window must cost no more.
    echo "(e) the wizard window against the command line, emulated line rate 38400 baud 8E1"
    "$bin/zx917-mkfile" --bytes 200000 "$work/GUI.HEX" >/dev/null
    sim_line() {
        rm -f "$work/com1" "$work/report.json"
        "$bin/zx917-sim" --link "$work/com1" --once --line-rate --answer-delay 0 \
            --program-delay 500 --expect "$work/GUI.HEX" --report "$work/report.json" 2>/dev/null &
        sim_pid=$!
        for _ in $(seq 50); do [ -e "$work/com1" ] && break; sleep 0.05; done
    }
    sim_done() {
        for _ in $(seq 100); do kill -0 "$sim_pid" 2>/dev/null || break; sleep 0.05; done
        sim_pid=""
        [ "$(json "$work/report.json" "d['verdict']")" = success ] || exit 1
    }
    ratio() {
        python3 - "$work/report.json" "$@" <<'PY'
import json, sys
d = json.load(open(sys.argv[1])); t = d["transfer"]
ideal_ms = (t["bytes_in"] + t["bytes_out"]) * 11 / 38400 * 1000 + t["delays_ms"]
wall, cpu, who = float(sys.argv[2]), float(sys.argv[3]), sys.argv[4]
print(f"    {who}: transfer {t['ms']} ms, ideal {ideal_ms:.0f} ms: ratio {t['ms'] / ideal_ms:.3f};"
      f" CPU {100 * cpu / wall:.2f} % of {wall:.1f} s")
PY
    }
    sim_line
    /usr/bin/env time -f "%e %U %S" -o "$work/time" "$bin/zx917-download" download \
        --port "$work/com1" --file "$work/GUI.HEX" --yes >/dev/null 2>"$work/err"
    sim_done
    read -r wall user sys < <(tail -1 "$work/time")
    ratio "$wall" "$(python3 -c "print($user + $sys)")" "command line (whole run)"
    sim_line
    read -r wall cpu ok < <("$zx917_root/build/bench/zx917-gui-bench" "$work/com1" "$work/GUI.HEX")
    sim_done
    [ "$ok" = 1 ] || exit 1
    ratio "$wall" "$cpu" "window, clip playing (from Execute)"
fi

if part f; then
    echo "(f) recording a download in the service record (a 200 KB file hashed)"
    "$bin/zx917-mkfile" --bytes 200000 "$work/REC.HEX" >/dev/null
    mkdir -p "$work/record"
    read -r fresh full attempts < <("$zx917_root/build/bench/zx917-history-bench" "$work/record" \
        "$work/REC.HEX" 2000)
    python3 -c "print(f'    new record {$fresh:.1f} ms, record of $attempts attempts {$full:.1f} ms; of the 50 ms allowed: ratio {max($fresh, $full) / 50:.3f}')"
fi
