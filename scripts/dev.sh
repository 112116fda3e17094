#!/usr/bin/env bash
# The project's two set-up commands:
#   bash scripts/dev.sh run    install what is missing, build, start the program
#   bash scripts/dev.sh test   install what is missing, build, run every test
# Safe to repeat: installed packages, the configured build and up-to-date
# objects are kept, so a second run only does what changed.
set -euo pipefail
cd "$(dirname "$0")/.."

packages=(g++ cmake ninja-build pkg-config qt6-base-dev libgl-dev fonts-dejavu-core
          libgtest-dev libgmock-dev libbenchmark-dev nlohmann-json3-dev)

install_missing() {
    local missing=() p
    for p in "${packages[@]}"; do
        dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q 'install ok installed' ||
            missing+=("$p")
    done
    [ ${#missing[@]} -eq 0 ] && return
    local sudo=()
    [ "$(id -u)" -ne 0 ] && sudo=(sudo)
    echo "Installing Debian packages: ${missing[*]}"
    "${sudo[@]}" apt-get update
    DEBIAN_FRONTEND=noninteractive "${sudo[@]}" apt-get install -y --no-install-recommends "${missing[@]}"
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
        build
        ctest --preset default
        ;;
    *)
        echo "usage: bash scripts/dev.sh run|test" >&2
        exit 2
        ;;
esac
