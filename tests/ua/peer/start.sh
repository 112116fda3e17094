#!/usr/bin/env bash
# Starts the test peer in the background for a CTest fixture and returns once it
# listens:  start.sh <state-folder> [server.js options...]
# The state folder receives server.log (all of the peer's output), pid, and url
# (the endpoint URL, written only once the peer is ready). XDG_CONFIG_HOME points
# into the state folder, so the peer's self-signed certificate lands there.
set -euo pipefail

peer_dir="$(cd "$(dirname "$0")" && pwd)"
ready_timeout_s=60

state="${1:?usage: start.sh <state-folder> [server options...]}"
shift

if ! command -v node >/dev/null; then
    echo "The OPC UA test peer needs Node.js (18 or later), and 'node' is not on PATH." >&2
    echo "Run the README's test command (bash scripts/dev.sh test), which installs it." >&2
    exit 1
fi
if [ ! -d "$peer_dir/node_modules/node-opcua" ]; then
    echo "The OPC UA test peer is not installed: $peer_dir/node_modules is missing." >&2
    echo "Run the README's test command (bash scripts/dev.sh test), or 'npm ci' in $peer_dir." >&2
    exit 1
fi

# A peer left over from an earlier run of this fixture goes first.
bash "$peer_dir/stop.sh" "$state" >/dev/null
mkdir -p "$state/config"
rm -f "$state/url" "$state/pid"
# The log exists before the peer starts, so the wait below can read it at once.
: >"$state/server.log"

# The parent (CTest) is passed on: the peer ends by itself once it has gone.
XDG_CONFIG_HOME="$state/config" nohup node "$peer_dir/server.js" --exit-with-pid "$PPID" "$@" \
    >"$state/server.log" 2>&1 </dev/null &
pid=$!
echo "$pid" >"$state/pid"

for ((i = 0; i < ready_timeout_s * 10; ++i)); do
    url="$(sed -n 's/^READY //p' "$state/server.log")"
    if [ -n "$url" ]; then
        echo "$url" >"$state/url.tmp"
        mv "$state/url.tmp" "$state/url"
        echo "The test peer (process $pid) listens at $url"
        exit 0
    fi
    if ! kill -0 "$pid" 2>/dev/null; then
        echo "The test peer ended before it was ready. Its output ($state/server.log):" >&2
        cat "$state/server.log" >&2
        rm -f "$state/pid"
        exit 1
    fi
    sleep 0.1
done

echo "The test peer was not ready after ${ready_timeout_s} s. Its output so far:" >&2
cat "$state/server.log" >&2
bash "$peer_dir/stop.sh" "$state" >/dev/null
exit 1
