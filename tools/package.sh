#!/usr/bin/env bash
# Builds the Debian package build/zx917_<version>-<revision>_amd64.deb: the wizard and its
# program folder in /usr/lib/zx917, the launchers zx917a, zx917-download and zx917-sim, the
# desktop entry, icons, AppStream metainfo and man pages. Installs what it needs first.
#   tools/package.sh && sudo apt install ./build/zx917_*.deb
set -euo pipefail
zx917_root="$(cd "$(dirname "$0")/.." && pwd)"
source "$zx917_root/tools/deps.sh"
zx917_packages+=("${zx917_package_tools[@]}")
ensure_deps
build_project "$zx917_root/build"
rm -f "$zx917_root"/build/zx917_*.deb
(cd "$zx917_root/build" && cpack -G DEB >/dev/null)
ls "$zx917_root"/build/zx917_*.deb
