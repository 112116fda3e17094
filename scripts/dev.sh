#!/usr/bin/env bash
# The project's two set-up commands:
#   bash scripts/dev.sh run    install what is missing, build, start the program
#   bash scripts/dev.sh test   install what is missing (with the OPC UA test peer),
#                              build, run every test
# Safe to repeat: installed packages, the configured build and up-to-date
# objects are kept, so a second run only does what changed.
set -euo pipefail
cd "$(dirname "$0")/.."

packages=(g++ cmake ninja-build pkg-config qt6-base-dev qt6-svg-dev libgl-dev fonts-dejavu-core
          libgtest-dev libgmock-dev libbenchmark-dev libasio-dev
          nlohmann-json3-dev libssl-dev)

apt_install() {
    local sudo=()
    [ "$(id -u)" -ne 0 ] && sudo=(sudo)
    echo "Installing Debian packages: $*"
    "${sudo[@]}" apt-get update
    DEBIAN_FRONTEND=noninteractive "${sudo[@]}" apt-get install -y --no-install-recommends "$@"
}

install_missing() {
    local missing=() p
    for p in "${packages[@]}"; do
        dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q 'install ok installed' ||
            missing+=("$p")
    done
    [ ${#missing[@]} -eq 0 ] || apt_install "${missing[@]}"
}

# The OPC UA tests talk to node-opcua (tests/ua/peer), pinned by its
# package-lock.json and installed with npm ci whenever that file changed.
peer_dir=tests/ua/peer

install_peer() {
    if ! command -v node >/dev/null || ! command -v npm >/dev/null; then
        apt_install nodejs npm
    fi
    local major
    major="$(node --version | sed 's/^v\([0-9]*\).*/\1/')"
    if [ "$major" -lt 18 ]; then
        echo "The OPC UA test peer needs Node.js 18 or later; this machine has $(node --version)." >&2
        echo "Install a newer Node.js, then run this command again." >&2
        exit 1
    fi
    if [ ! -d "$peer_dir/node_modules" ] ||
        [ "$peer_dir/package-lock.json" -nt "$peer_dir/node_modules/.package-lock.json" ]; then
        echo "Installing the OPC UA test peer (npm ci in $peer_dir)"
        (cd "$peer_dir" && npm ci --no-audit --no-fund)
    fi
}

build() {
    [ -f build/default/CMakeCache.txt ] || cmake --preset default
    cmake --build --preset default
}

case "${1:-}" in
    run)
        install_missing
        build
        if [ -z "${DISPLAY:-}${WAYLAND_DISPLAY:-}" ] && [ -z "${QT_QPA_PLATFORM:-}" ]; then
            echo "Built. There is no display here (DISPLAY and WAYLAND_DISPLAY are unset), so the"
            echo "window cannot open. Run this command in a desktop session, or under xvfb-run."
            exit 1
        fi
        exec build/default/src/cvopctestclient
        ;;
    test)
        install_missing
        install_peer
        build
        ctest --preset default
        ;;
    *)
        echo "usage: bash scripts/dev.sh run|test" >&2
        exit 2
        ;;
esac
