# Shared by the scripts of this folder: where the tree is, saying what is done, installing packages, building.
# Sourced, not run.

set -euo pipefail
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)
cd "$root"

if [ -t 1 ]; then bold=$'\e[1m' plain=$'\e[0m'; else bold='' plain=''; fi
say() { printf '%s==> %s%s\n' "$bold" "$*" "$plain"; }
fail() {
    printf 'error: %s\n' "$*" >&2
    exit 1
}

as_root() {
    if [ "$(id -u)" -eq 0 ]; then
        "$@"
    elif command -v sudo >/dev/null; then
        sudo "$@"
    else
        fail "installing packages needs root: run this once as root, or install sudo"
    fi
}

# install_packages NAME...: installs the Debian packages that are not there yet.
install_packages() {
    local missing=() name
    for name in "$@"; do
        dpkg-query -W -f '${db:Status-Status}' "$name" 2>/dev/null | grep -qx installed || missing+=("$name")
    done
    if [ ${#missing[@]} -eq 0 ]; then
        say "All needed packages are installed"
        return
    fi
    say "Installing ${missing[*]}"
    as_root apt-get update -qq
    as_root env DEBIAN_FRONTEND=noninteractive apt-get install -y -qq --no-install-recommends "${missing[@]}"
}

build_packages=(g++ cmake ninja-build pkg-config libboost-dev)
tool_packages=(libpng-dev libcli11-dev libcairo2-dev fonts-dejavu-core)
test_packages=(libgtest-dev libopencolorio-dev python3 ffmpeg libdv4-dev)
bench_packages=(libbenchmark-dev libyuv-dev libpixman-1-dev libswscale-dev libavcodec-dev libavfilter-dev libavutil-dev
    libopencv-core-dev libopencv-imgproc-dev libzimg-dev libopencolorio-dev cimg-dev libdv4-dev)

# configure DIRECTORY [CMAKE_ARGUMENT...]
configure() {
    local directory=$1
    shift
    say "Configuring $directory"
    cmake -S . -B "$directory" -G Ninja "$@" >"$directory.configure.log" 2>&1 ||
        { cat "$directory.configure.log" >&2; fail "configuration failed"; }
}

# build DIRECTORY [CMAKE_ARGUMENT...]: configures and builds; ninja shows the progress.
build() {
    configure "$@"
    say "Building $1 (the first time takes some minutes)"
    cmake --build "$1"
}

# The last processor: the system prefers the first one for its own work.
on_one_processor() { taskset -c "$(($(nproc) - 1))" "$@"; }
mkdir -p build
