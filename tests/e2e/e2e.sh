#!/usr/bin/env bash
# End to end: zx917-download with the Qt serial adapter against zx917-sim on a pseudo-terminal,
# with real timers. Usage: e2e.sh SCENARIO BUILD_DIR
set -uo pipefail
scenario="$1"
bin="$2/tools"
work="$(mktemp -d)"
sim_pid=""
cleanup() {
    [ -n "$sim_pid" ] && kill "$sim_pid" 2>/dev/null && wait "$sim_pid" 2>/dev/null
    rm -rf "$work"
}
trap cleanup EXIT
export ZX917_HISTORY="$work/history.sqlite"  # downloads of the tests stay out of the user's record
fail() { echo "FAIL ($scenario): $*" >&2; exit 1; }

start_sim() {
    "$bin/zx917-sim" --link "$work/com1" --report "$work/report.json" "$@" 2>"$work/sim.err" &
    sim_pid=$!
    for _ in $(seq 50); do [ -e "$work/com1" ] && return 0; sleep 0.05; done
    fail "the simulator did not start"
}
stop_sim() {
    kill "$sim_pid" 2>/dev/null
    wait "$sim_pid" 2>/dev/null
    sim_pid=""
}
# Waits for a simulator started with --once to write its report.
wait_sim() {
    for _ in $(seq 100); do kill -0 "$sim_pid" 2>/dev/null || break; sleep 0.05; done
    stop_sim
}
make_file() { "$bin/zx917-mkfile" "$@" "$work/NEW.HEX" >/dev/null || fail "zx917-mkfile"; }
download() {
    timeout 120 "$bin/zx917-download" download --port "$work/com1" --file "$work/NEW.HEX" --yes \
        --trace "$work/trace.txt" "$@" >"$work/out" 2>"$work/err"
}
expect_in() { grep -qF -- "$1" "$2" || { cat "$2" >&2; fail "'$1' not in $(basename "$2")"; }; }
expect_not_in() { ! grep -qF -- "$1" "$2" || fail "'$1' in $(basename "$2")"; }

case "$scenario" in
identify)
    start_sim --revision B.03.07
    timeout 60 "$bin/zx917-download" identify --port "$work/com1" >"$work/out" 2>"$work/err" \
        || fail "identify exited $?"
    stop_sim
    expect_in "current revision: B.03.07" "$work/out"
    expect_in "AMPS flag: 1" "$work/out"
    # Entered at the user's speed, answered at the download speed.
    expect_in '{"command": "MAINTENANCE:DOWNLOAD", "settings": "9600,*,*,1"' "$work/report.json"
    expect_in '{"command": "REVD X.XX.XX", "settings": "38400,*,*,1"' "$work/report.json"
    expect_not_in "answer lost" "$work/sim.err"
    ;;
download-intel | download-srec)
    args=(--bytes 40000)
    [ "$scenario" = download-srec ] && args+=(--srec)
    make_file "${args[@]}"
    start_sim --once --expect "$work/NEW.HEX" --noise
    download || fail "download exited $? $(cat "$work/err")"
    wait_sim
    expect_in "Download successfully completed." "$work/out"
    expect_in '"verdict": "success"' "$work/report.json"
    expect_in "TX [38400,E,8,1 hs3] REBOOT" "$work/trace.txt"
    ;;
amps-off)
    make_file --bytes 20000
    start_sim --once --expect "$work/NEW.HEX" --amps-flag 0
    download || fail "download exited $?"
    wait_sim
    expect_in '"verdict": "success"' "$work/report.json"
    expect_not_in '"command": "SP4"' "$work/report.json"
    ;;
restarts)
    make_file --bytes 20000
    start_sim --once --expect "$work/NEW.HEX" --fault restart:P3:5:2
    download || fail "two restarts must be granted"
    wait_sim
    expect_in '"restarts": 2' "$work/report.json"
    expect_in '"verdict": "success"' "$work/report.json"
    expect_in "restart granted: RESTART:P3" "$work/trace.txt"
    ;;
failures)
    for fault in "--fault restart:P3:5:3" "--fault abort:OPEN" "--fault abort:DL:30" \
        "--wrong-revc" "--fault garble:REVC" "--fault refuse:EP:2"; do
        make_file --bytes 20000
        # shellcheck disable=SC2086
        start_sim --expect "$work/NEW.HEX" $fault
        download && fail "$fault: reported success"
        stop_sim
        expect_in "Download failed." "$work/err"
        expect_not_in "Download successfully completed." "$work/out"
        expect_in '"verdict": "failure"' "$work/report.json"
    done
    ;;
hangup)
    make_file --bytes 20000
    start_sim --once --fault hangup:DL:40
    download && fail "reported success after the line hung up"
    expect_in "Download failed." "$work/err"
    wait_sim
    ;;
no-port)
    timeout 30 "$bin/zx917-download" identify --port "$work/none" >"$work/out" 2>"$work/err" \
        && fail "identify on a missing port succeeded"
    expect_in "Communication port does not exist," "$work/err"
    expect_in "no such device" "$work/err"
    ;;
*)
    fail "unknown scenario"
    ;;
esac
echo "PASS ($scenario)"
