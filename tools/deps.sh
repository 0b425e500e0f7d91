# Installs the Debian packages the project needs, only when one is missing.
# fonts-liberation2 is metric-compatible with Arial, the windows' design font.
zx917_packages=(cmake g++ ninja-build pkg-config qt6-base-dev qt6-serialport-dev
    qt6-svg-dev libsqlite3-dev libgtest-dev libgmock-dev socat time python3 clang libclang-rt-14-dev fonts-liberation2)

# What the package and its checks need (tools/package.sh, the package test).
zx917_package_tools=(dpkg-dev help2man lintian desktop-file-utils appstream)

ensure_deps() {
    local missing=()
    for p in "${zx917_packages[@]}"; do
        dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "ok installed" || missing+=("$p")
    done
    [ ${#missing[@]} -eq 0 ] && return 0
    echo "Installing: ${missing[*]}" >&2
    local sudo=""
    [ "$(id -u)" -ne 0 ] && sudo="sudo"
    $sudo apt-get update
    DEBIAN_FRONTEND=noninteractive $sudo apt-get install -y "${missing[@]}"
}

build_project() {
    local dir="$1"
    shift
    cmake -S "$zx917_root" -B "$dir" -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo ${1+"$@"} >/dev/null
    cmake --build "$dir" -j"$(nproc)"
}
