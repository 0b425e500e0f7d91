#!/usr/bin/env bash
# The fault matrix: zx917-download (its test build, with 20 ms ticks) against zx917-sim on a
# pseudo-terminal for every fault option of the simulator. Success exactly when the instrument
# confirmed, the right message otherwise, the port put back on the user's settings, and no
# process left behind. Usage: fault_matrix.sh BUILD_DIR
set -uo pipefail
bin="$1/tools"
work="$(mktemp -d)"
sim_pid=""
failures=0
cases=0
cleanup() {
    [ -n "$sim_pid" ] && kill "$sim_pid" 2>/dev/null && wait "$sim_pid" 2>/dev/null
    rm -rf "$work"
}
trap cleanup EXIT
export ZX917_HISTORY="$work/history.sqlite"  # downloads of the tests stay out of the user's record
export ZX917_TICK_MS=20

"$bin/zx917-mkfile" --bytes 8000 "$work/NEW.HEX" >/dev/null

# name | simulator options | outcome: ok, failed (transfer) or noport (identification)
#      | the program's own options, when they differ from the defaults
matrix=(
    "plain||ok"
    "noise|--noise|ok"
    "AMPS flag 0|--amps-flag 0|ok"
    "newer file on an older revision|--revision A.00.09|ok"
    "long programming delay|--program-delay 600|ok"
    "line rate|--line-rate|ok"
    "quiet after REVC|--quiet-after-revc|ok"
    "terminator LF|--terminator lf|ok|--terminator lf"
    "terminator CR|--terminator cr|ok|--terminator cr"
    "instrument at 19200 8E1|--settings 19200,e,8,1|ok|--settings 19200,e,8,1"
    "XON/XOFF on the user's line||ok|--xon"
    "settings that differ from the instrument's|--settings 19200,n,8,1|noport"
    "slow OPEN|--open-delay 800|ok"
    "slow answers|--answer-delay 30|ok"
    "restart once|--fault restart:P2:3:1|ok"
    "restart twice|--fault restart:P4:2:2|ok"
    "restart three times|--fault restart:P1:2:3|failed"
    "identity only|--idn-only|failed"
    "no download mode|--no-download-mode|noport"
    "wrong REVC|--wrong-revc|failed"
    "hang-up mid-transfer|--fault hangup:DL:20|failed"
    "silent at *CLS|--fault silent:*CLS|ok"
    "silent at the error query|--fault silent:SYSTem:ERRor?|failed"
    "silent at *IDN?|--fault silent:*IDN?|ok"
    "silent at MAINTENANCE|--fault silent:MAINTENANCE:DOWNLOAD|noport"
    "silent at REVD (identification)|--fault silent:REVD|noport"
    "silent at REVD (new revision)|--fault silent:REVD:2|failed"
    "silent at OPEN|--fault silent:OPEN|failed"
    "silent at SP2|--fault silent:SP2|failed"
    "silent at SP1|--fault silent:SP1|failed"
    "silent at a record|--fault silent:DL:12|failed"
    "silent at a last record|--fault silent:DLE:2|failed"
    "silent at EP|--fault silent:EP:3|failed"
    "silent at CLOSE|--fault silent:CLOSE|failed"
    "silent at REVC|--fault silent:REVC|failed"
    "silent at REBOOT|--fault silent:REBOOT|failed"
    "silent once at *IDN? then answered|--fault silent:*IDN?:1:1|ok"
    "silent once at a record then answered|--fault silent:DL:7:1|ok"
    "abort at *IDN? (stage 0 and 1)|--fault abort:*IDN?|ok"
    "abort at MAINTENANCE (stage 2)|--fault abort:MAINTENANCE:DOWNLOAD|noport"
    "abort at OPEN (stage 3)|--fault abort:OPEN|failed"
    "abort at SP2 (stage 4)|--fault abort:SP2|failed"
    "abort at SP3 (stage 5)|--fault abort:SP3|failed"
    "abort at SP4 (stage 6)|--fault abort:SP4|failed"
    "abort at a record of MPU (stage 7)|--fault abort:DL:170|failed"
    "abort at CLOSE (stage 8)|--fault abort:CLOSE|failed"
    "abort at REBOOT (stage 8)|--fault abort:REBOOT|failed"
    "garbled error answer|--fault garble:SYSTem:ERRor?|failed"
    "garbled identity|--fault garble:*IDN?|ok"
    "garbled record answer|--fault garble:DL:9|failed"
    "garbled REVC|--fault garble:REVC|failed"
    "erase refused|--fault refuse:EP:2|failed"
    "parity kept across a silent instrument|--settings 9600,e,8,1 --fault silent:MAINTENANCE:DOWNLOAD|noport|--settings 9600,e,8,1"
    "silent at 19200,o,7,2 with XON/XOFF|--settings 19200,o,7,2 --fault silent:MAINTENANCE:DOWNLOAD|noport|--settings 19200,o,7,2 --xon"
    "a second identification after a failed one|--settings 9600,e,8,1 --fault silent:MAINTENANCE:DOWNLOAD:1:2|ok|--settings 9600,e,8,1 --tries 2"
)

for row in "${matrix[@]}"; do
    IFS='|' read -r name simargs outcome progargs <<<"$row"
    # shellcheck disable=SC2206
    extra=($progargs)
    user_settings=9600,n,8,1
    user_hs=0
    for ((i = 0; i < ${#extra[@]}; i++)); do
        [ "${extra[$i]}" = --settings ] && user_settings="${extra[$((i + 1))]}"
        [ "${extra[$i]}" = --xon ] && user_hs=1
    done
    cases=$((cases + 1))
    rm -f "$work/com1" "$work/report.json" "$work/trace.txt"
    # shellcheck disable=SC2086
    "$bin/zx917-sim" --link "$work/com1" --report "$work/report.json" --expect "$work/NEW.HEX" \
        $simargs 2>"$work/sim.err" &
    sim_pid=$!
    for _ in $(seq 50); do [ -e "$work/com1" ] && break; sleep 0.05; done
    timeout 120 "$bin/zx917-download-fasttick" download --port "$work/com1" --file "$work/NEW.HEX" \
        --yes --trace "$work/trace.txt" "${extra[@]}" >"$work/out" 2>"$work/err"
    rc=$?
    kill "$sim_pid" 2>/dev/null
    wait "$sim_pid" 2>/dev/null
    sim_pid=""
    problems=()
    confirmed=$(grep -o '"confirmed": [a-z]*' "$work/report.json" | cut -d' ' -f2)
    case "$outcome" in
    ok)
        [ "$rc" = 0 ] || problems+=("exit $rc, not 0")
        grep -q "Download successfully completed." "$work/out" || problems+=("no completion")
        grep -q '"verdict": "success"' "$work/report.json" || problems+=("simulator: not success")
        ;;
    failed)
        [ "$rc" = 1 ] || problems+=("exit $rc, not 1")
        grep -q "^Download failed.$" "$work/err" || problems+=("no 'Download failed.'")
        ;;
    noport)
        [ "$rc" = 1 ] || problems+=("exit $rc, not 1")
        grep -q "^Communication port does not exist,$" "$work/err" || problems+=("no entry 0")
        grep -q "Download failed." "$work/err" && problems+=("a transfer was started")
        ;;
    esac
    # Never success that the instrument did not confirm, never a failure that it did.
    { [ "$rc" = 0 ] && [ "$confirmed" = true ]; } || { [ "$rc" != 0 ] && [ "$confirmed" != true ]; } ||
        problems+=("exit $rc but the instrument's confirmation is '$confirmed'")
    # Every close, also after a failed identification that is tried again, is on the user's
    # settings, exactly as the user wrote them.
    closes=$(grep -c "port closed at" "$work/trace.txt")
    [ "$closes" -ge 1 ] || problems+=("the port was never closed")
    while IFS= read -r line; do
        [[ "$line" == *"port closed at $user_settings handshaking $user_hs" ]] ||
            problems+=("port not put back: '$line'")
    done < <(grep "port closed at" "$work/trace.txt")
    pgrep -f "$work/com1" >/dev/null && problems+=("a process was left behind")
    if [ ${#problems[@]} -eq 0 ]; then
        echo "ok      $name"
    else
        failures=$((failures + 1))
        echo "FAILED  $name: ${problems[*]}"
        sed 's/^/    /' "$work/err" | tail -5
    fi
done
echo "$((cases - failures)) of $cases fault cases behaved"
[ "$failures" = 0 ]
