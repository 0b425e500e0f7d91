#!/usr/bin/env bash
# The Debian package as a user gets it: built with cpack, checked by lintian,
# desktop-file-validate and appstreamcli, unpacked into a scratch root, its programs run from
# there, and its wizard started offscreen from a program folder it may not write to: the
# download folder appears in the user's data folder.
#   tests/package/package_test.sh BUILD_DIR
set -euo pipefail
build="$(cd "$1" && pwd)"
for tool in cpack dpkg-deb lintian desktop-file-validate appstreamcli help2man setpriv; do
    command -v "$tool" >/dev/null || { echo "package test: $tool is missing (tools/package.sh installs it)" >&2; exit 1; }
done
scratch="$(mktemp -d)"
pid=""
cleanup() {
    [ -n "$pid" ] && kill "$pid" 2>/dev/null
    chmod -R u+w "$scratch" 2>/dev/null
    rm -rf "$scratch"
}
trap cleanup EXIT
chmod 755 "$scratch"

echo "== cpack"
(cd "$build" && cpack -G DEB -B "$scratch/out" >/dev/null)
deb="$(ls "$scratch"/out/zx917_*_amd64.deb)"
echo "$(basename "$deb")"

echo "== lintian"
status=0
lintian --fail-on error,warning "$deb" >"$scratch/lintian.log" 2>&1 || status=$?
grep -v "running with root privileges" "$scratch/lintian.log" || true
[ "$status" = 0 ] || { echo "lintian failed ($status)" >&2; exit 1; }

echo "== unpacked into a scratch root"
root="$scratch/root"
dpkg-deb -x "$deb" "$root"
desktop-file-validate "$root"/usr/share/applications/com.quorvex.zx917a.desktop
appstreamcli validate --no-net "$root"/usr/share/metainfo/com.quorvex.zx917a.metainfo.xml
for f in /usr/share/icons/hicolor/scalable/apps/com.quorvex.zx917a.svg \
    /usr/share/icons/hicolor/256x256/apps/com.quorvex.zx917a.png \
    /usr/share/man/man1/zx917a.1.gz /usr/share/doc/zx917/copyright \
    /usr/lib/zx917/ZX917A.HLP /usr/lib/zx917/Filemove.avi; do
    [ -s "$root$f" ] || { echo "missing: $f" >&2; exit 1; }
done
version="$(dpkg-deb -f "$deb" Version)"
"$root"/usr/bin/zx917-download --version | grep -qx "zx917-download ${version%-*}"
"$root"/usr/bin/zx917a --version | grep -qx "zx917a ${version%-*}"
"$root"/usr/bin/zx917-sim --help | grep -q "^usage: zx917-sim"
for p in zx917a zx917-download zx917-sim; do
    status=0
    "$root/usr/bin/$p" --no-such-option >/dev/null 2>&1 || status=$?
    [ "$status" = 2 ] || { echo "$p: an unknown option ended with $status, not 2" >&2; exit 1; }
done
echo "programs answer --version and --help, refuse unknown options with 2"

echo "== the wizard from a program folder it may not write to"
chmod -R a-w "$root/usr/lib/zx917"
home="$scratch/home"
mkdir -p "$home/run" && chmod 700 "$home/run"
as_user=()
if [ "$(id -u)" = 0 ]; then
    # root may write anywhere: the wizard runs as nobody, as an engineer would run it.
    chown -R nobody "$home"
    as_user=(setpriv --reuid=nobody --regid=nogroup --clear-groups)
fi
env -i PATH=/usr/bin:/bin HOME="$home" XDG_DATA_HOME="$home/data" XDG_RUNTIME_DIR="$home/run" \
    QT_QPA_PLATFORM=offscreen ZX917_COM1=/nonexistent \
    ${as_user[@]+"${as_user[@]}"} "$root/usr/bin/zx917a" >"$scratch/wizard.log" 2>&1 &
pid=$!
for _ in $(seq 300); do
    [ -d "$home/data/ZX917A/HEX" ] && break
    kill -0 "$pid" 2>/dev/null || break
    sleep 0.1
done
if [ ! -d "$home/data/ZX917A/HEX" ]; then
    echo "no download folder under XDG_DATA_HOME" >&2
    cat "$scratch/wizard.log" >&2
    exit 1
fi
[ ! -e "$root/usr/lib/zx917/HEX" ] || { echo "HEX made in the program folder" >&2; exit 1; }
kill -0 "$pid" || { echo "the wizard did not keep running" >&2; exit 1; }
echo "download folder: \$XDG_DATA_HOME/ZX917A/HEX; the wizard is running"
