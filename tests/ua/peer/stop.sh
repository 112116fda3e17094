#!/usr/bin/env bash
# Stops the test peer that start.sh started for a fixture:  stop.sh <state-folder>
# It asks with SIGTERM, then insists with SIGKILL, and fails only if the process
# is still there afterwards. A peer that has already shut down is fine.
set -euo pipefail

state="${1:?usage: stop.sh <state-folder>}"
pid_file="$state/pid"

[ -f "$pid_file" ] || { echo "No test peer is running for $state"; exit 0; }
pid="$(cat "$pid_file")"

# Only our peer: a recycled process id belongs to someone else.
is_peer() {
    { tr '\0' ' ' <"/proc/$pid/cmdline"; } 2>/dev/null | grep -q 'server\.js'
}

stop_with() {
    local signal="$1" tenths="$2"
    is_peer || return 0
    kill "-$signal" "$pid" 2>/dev/null || true
    for ((i = 0; i < tenths; ++i)); do
        is_peer || return 0
        sleep 0.1
    done
}

stop_with TERM 100
stop_with KILL 50
if is_peer; then
    echo "The test peer (process $pid) is still running after SIGKILL" >&2
    exit 1
fi
rm -f "$pid_file" "$state/url"
echo "The test peer (process $pid) has stopped"
