#!/usr/bin/env bash
# Screenshots of the six wizard pages and the file chooser, taken under Xvfb with the real
# ZX917A against zx917-sim, by clicks at the places the pages are designed with and keys.
#   tools/screenshots.sh [OUTPUT_DIR]     (docs/screenshots by default)
set -euo pipefail
zx917_root="$(cd "$(dirname "$0")/.." && pwd)"
source "$zx917_root/tools/deps.sh"
ensure_deps
need=()
for p in xvfb xdotool imagemagick; do
    dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "ok installed" || need+=("$p")
done
if [ ${#need[@]} -gt 0 ]; then
    sudo=""
    [ "$(id -u)" -ne 0 ] && sudo="sudo"
    $sudo apt-get update && DEBIAN_FRONTEND=noninteractive $sudo apt-get install -y "${need[@]}"
fi
build_project "$zx917_root/build" >/dev/null
out="${1:-$zx917_root/docs/screenshots}"
mkdir -p "$out"
bin="$zx917_root/build/tools"
work="$(mktemp -d)"
pids=()
cleanup() {
    for p in "${pids[@]}"; do kill "$p" 2>/dev/null || true; done
    rm -rf "$work"
}
trap cleanup EXIT

# A program folder of its own, with the help file, the clip and a demo file in "HEX".
cp "$zx917_root/build/program/ZX917A" "$zx917_root/build/program/ZX917A.HLP" \
    "$zx917_root/build/program/Filemove.avi" "$work/"
mkdir -p "$work/HEX"
"$bin/zx917-mkfile" --revision A.02.00 --bytes 60000 "$work/HEX/demo.hex" >/dev/null
"$bin/zx917-sim" --link "$work/COM1" --revision A.01.02 --line-rate --program-delay 1500 \
    2>/dev/null >/dev/null &
pids+=($!)
display=":$((90 + RANDOM % 100))"
Xvfb "$display" -screen 0 1024x768x24 -nolisten tcp >/dev/null 2>&1 &
pids+=($!)
export DISPLAY="$display"
for _ in $(seq 50); do xdpyinfo >/dev/null 2>&1 && [ -e "$work/COM1" ] && break; sleep 0.1; done
cd "$work"
ZX917_HISTORY="$work/history.sqlite" XDG_RUNTIME_DIR="$work" ZX917_COM1="$work/COM1" "$work/ZX917A" >/dev/null 2>&1 &
pids+=($!)

window() {  # the id of the window with this exact title
    for _ in $(seq 100); do
        id=$(xdotool search --onlyvisible --name "^$1\$" 2>/dev/null | head -1 || true)
        [ -n "$id" ] && { echo "$id"; return 0; }
        sleep 0.1
    done
    echo "no window '$1'" >&2
    return 1
}
shot() { sleep "${3:-0.5}"; import -window "$1" "$out/$2.png"; echo "$out/$2.png"; }
# Clicks at a place given in twips of the window's client area.
click() { xdotool mousemove --window "$1" $(($2 / 15)) $(($3 / 15)) click 1; }
next() { click "$main" 4560 4140; }  # the forward button of the button row

main=$(window "Quorvex ZX917 Download Program Ver.02.01")
shot "$main" page0-introduction 1
next
shot "$main" page1-settings
next
shot "$main" page2-firmware 3
click "$main" 2040 3000  # "Select the Download File for the New Firmware"
chooser=$(window Open)
shot "$chooser" chooser-open
click "$chooser" 3000 3590  # the name box
xdotool type --delay 50 "demo.hex"
xdotool key Return
shot "$chooser" chooser-checked
xdotool key Return  # "&Open" has the focus
shot "$main" page2-file-chosen 1
next
shot "$main" page3-confirmation
next
xdotool key Return  # "OK to start the download?"
shot "$main" page4-transfer 6
# The completion page has nothing where the transfer page has its progress bar.
for _ in $(seq 180); do
    sleep 1
    import -window "$main" "$work/now.png"
    [ "$(convert "$work/now.png" -crop 440x1+90+205 +repage -format '%k' info:)" = 1 ] && break
done
shot "$main" page5-completion 1
