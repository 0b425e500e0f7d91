#!/usr/bin/env bash
# The service record end to end: zx917-download against zx917-sim on pseudo-terminals, each
# attempt's row read back with `zx917-download history`. Usage: history.sh BUILD_DIR
set -uo pipefail
bin="$1/tools"
work="$(mktemp -d)"
pids=()
cleanup() {
    for p in "${pids[@]}"; do kill "$p" 2>/dev/null; done
    wait 2>/dev/null
    rm -rf "$work"
}
trap cleanup EXIT
fail() { echo "FAIL (history): $*" >&2; exit 1; }
export ZX917_TICK_MS=20  # the fast test build's ticks: time-outs in a fraction of a second
dl="$bin/zx917-download-fasttick"

# start_sim NAME [options]: a simulator linked at $work/NAME.
start_sim() {
    local name="$1"
    shift
    "$bin/zx917-sim" --link "$work/$name" --revision A.01.00 "$@" >/dev/null 2>&1 &
    pids+=($!)
    for _ in $(seq 100); do [ -e "$work/$name" ] && return 0; sleep 0.05; done
    fail "simulator $name did not start"
}
# row FIELD [INDEX]: a field of the newest (or INDEX-th newest) attempt, from --json.
row() {
    "$dl" history --all --json | python3 -c '
import json, sys
rows = json.load(sys.stdin)
v = rows[int(sys.argv[2])][sys.argv[1]]
sys.stdout.write("" if v is None else str(v))' "$1" "${2:-0}"
}
count() { "$dl" history --all --json | python3 -c 'import json,sys; print(len(json.load(sys.stdin)))'; }

"$bin/zx917-mkfile" --revision A.02.00 --bytes 6000 "$work/NEW.HEX" >/dev/null || fail mkfile
export ZX917_HISTORY="$work/history.sqlite"

echo "== no record yet: no rows, status 0"
"$dl" history >"$work/out" || fail "history without a record exited $?"
grep -q "No download attempts recorded" "$work/out" || fail "$(cat "$work/out")"

echo "== success, a failure, an abort, a lost port, a cancel: one row each"
# An identity and a file name that SQL, CSV and JSON each take apart, with a byte that is not
# ASCII in each (the identity is the instrument's single-byte text, the name UTF-8).
identity=$'Quorvex,"ZX917";S/N \'12\',3\xe9'
name=$'NEW,"x";\xc3\xa9 1.HEX'
cp "$work/NEW.HEX" "$work/$name"
start_sim good --identity "$identity"
"$dl" download --port "$work/good" --file "$work/$name" --yes >"$work/out" 2>&1 \
    || fail "download exited $?: $(cat "$work/out")"
for case in "silent:SP2 failed" "abort:DL:5 aborted_by_instrument" "hangup:DL:5 port_lost"; do
    set -- $case
    start_sim "sim-$1" --fault "$1"
    "$dl" download --port "$work/sim-$1" --file "$work/NEW.HEX" --yes >/dev/null 2>&1 \
        && fail "download with $1 succeeded"
    [ "$(row outcome)" = "${2//_/ }" ] || fail "$1 recorded as '$(row outcome)', not '${2//_/ }'"
done
start_sim cancel
"$dl" download --port "$work/cancel" --file "$work/NEW.HEX" </dev/null >/dev/null 2>&1 \
    && fail "a download without an answer to 'OK to start' went on"
[ "$(row outcome)" = cancelled ] || fail "no answer recorded as '$(row outcome)'"
[ "$(count)" = 5 ] || fail "$(count) rows, not 5"

echo "== the successful row: identity, revisions, file and its SHA-256, as they were"
python3 - "$work" "$dl" "$identity" "$name" "$(sha256sum "$work/$name" | cut -d' ' -f1)" <<'PY' || fail "fields"
import csv, io, json, subprocess, sys
work, dl, identity, name, sha = sys.argv[1:6]
# The instrument's answer: its 39 characters, then the revision.
identity = identity.encode("utf-8", "surrogateescape").decode("latin-1").ljust(39, "-")
name = name.encode("utf-8", "surrogateescape").decode("utf-8")
as_json = json.loads(subprocess.run([dl, "history", "--all", "--json"], capture_output=True, check=True).stdout)
text = subprocess.run([dl, "history", "--all", "--csv"], capture_output=True, check=True).stdout.decode("utf-8")
as_csv = list(csv.DictReader(io.StringIO(text, newline="")))
for rows, form in ((as_json, "json"), (as_csv, "csv")):
    r = rows[-1]  # the oldest: the successful one
    want = {"outcome": "success", "front_end": "command line", "identity": identity + "A.01.00",
            "revision_before": "A.01.00", "revision_announced": "A.02.00",
            "revision_confirmed": "A.02.00", "file_name": name, "file_path": work + "/" + name,
            "file_sha256": sha, "port": work + "/good", "line_settings": "9600,n,8,1 CR+LF"}
    for k, v in want.items():
        if r[k] != v:
            sys.exit(f"{form}: {k} is {r[k]!r}, not {v!r}")
    if int(r["records_sent"]) < 20 or int(r["file_size"]) < 6000 or not r["ended"]:
        sys.exit(f"{form}: counts {r}")
PY
"$dl" history --instrument "S/N '12'" --json | python3 -c 'import json,sys; sys.exit(len(json.load(sys.stdin)) != 1)' \
    || fail "--instrument"
"$dl" history --limit 2 | tail -n +2 | wc -l | grep -qx 2 || fail "--limit 2"

echo "== a process killed during the transfer leaves an interrupted row"
start_sim slow --line-rate
"$bin/zx917-download" download --port "$work/slow" --file "$work/NEW.HEX" --yes >/dev/null 2>&1 &
victim=$!
for _ in $(seq 100); do [ "$(row records_sent)" != "" ] && [ "$(row outcome)" = interrupted ] && break; sleep 0.1; done
sleep 1
kill -9 "$victim"
wait "$victim" 2>/dev/null
[ "$(row outcome)" = interrupted ] || fail "killed download recorded as '$(row outcome)'"
[ "$(row ended)" = "" ] || fail "killed download has an end"
[ "$(row revision_announced)" = A.02.00 ] || fail "the interrupted row lacks what was known"

echo "== four downloads at once, four simulators: four complete rows"
export ZX917_HISTORY="$work/parallel.sqlite"
four=()
for n in 1 2 3 4; do
    start_sim "p$n"
    "$dl" download --port "$work/p$n" --file "$work/NEW.HEX" --yes >"$work/p$n.out" 2>&1 &
    four+=($!)
done
for p in "${four[@]}"; do wait "$p" || fail "a parallel download failed"; done
grep -l warning "$work"/p?.out && fail "a parallel download could not record"
[ "$("$dl" history --csv | grep -c ',success,')" = 4 ] || fail "$("$dl" history)"

echo "== a record that cannot be written: the same result, one warning line"
printf 'garbage%.0s' $(seq 600) >"$work/garbage.sqlite"
# A later version's record: a column more and a higher schema version; read, never written.
cp "$work/parallel.sqlite" "$work/newer.sqlite"
python3 -c '
import sqlite3, sys
db = sqlite3.connect(sys.argv[1]); db.execute("ALTER TABLE attempts ADD COLUMN later TEXT")
db.execute("PRAGMA user_version = 99"); db.commit()' "$work/newer.sqlite"
touch "$work/plain"
for record in "$work/plain/history.sqlite" "$work/garbage.sqlite" "$work/newer.sqlite"; do
    start_sim "w$((++n))"
    ZX917_HISTORY="$record" "$dl" download --port "$work/w$n" --file "$work/NEW.HEX" --yes \
        >"$work/w.out" 2>"$work/w.err" || fail "download exited $? with $record"
    grep -q "Download successfully completed." "$work/w.out" || fail "no success with $record"
    [ "$(grep -c warning "$work/w.err")" = 1 ] || fail "warnings with $record: $(cat "$work/w.err")"
done
ZX917_HISTORY="$work/garbage.sqlite" "$dl" history >/dev/null 2>"$work/w.err"
[ $? = 1 ] && grep -q "not a service record" "$work/w.err" || fail "history of garbage: $(cat "$work/w.err")"
[ "$(ZX917_HISTORY="$work/newer.sqlite" "$dl" history --csv | grep -c ',success,')" = 4 ] \
    || fail "the newer record is not read as it was"
echo "history: all cases as expected"
