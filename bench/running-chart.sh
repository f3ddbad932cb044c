#!/usr/bin/env bash
# The frames of the running program as the user sees them: starts the program on an X server
# of its own (Xvfb, 1920 x 1080, with openbox unless --no-wm), sizes its chart window to
# 1920 x 1061 (a maximised window under a title bar), lets the chart turn for a while and
# prints the gaps between the frames its render loop started and between the paints of its
# window: median, 99th percentile, largest, and the largest five with when they came.
#
# Usage: bench/running-chart.sh [--seconds=N] [--no-wm] PROGRAM [PROGRAM'S OPTIONS...]
#   e.g. bench/running-chart.sh build/app/nightdome --generate 1000000 --threads 2
# The first two seconds after the window is sized are left out (start-up, first paints).
set -euo pipefail

seconds=10
wm=openbox
while [[ "${1:-}" == --* ]]; do
    case "$1" in
        --seconds=*) seconds=${1#--seconds=} ;;
        --no-wm) wm= ;;
        *) echo "running-chart: unknown option $1" >&2; exit 2 ;;
    esac
    shift
done
[ $# -ge 1 ] || { echo "usage: $0 [--seconds=N] [--no-wm] PROGRAM [OPTIONS...]" >&2; exit 2; }

work=$(mktemp -d)
server= manager= program=
cleanup() {
    [ -n "$program" ] && kill "$program" 2>/dev/null && wait "$program" 2>/dev/null
    [ -n "$manager" ] && kill "$manager" 2>/dev/null && wait "$manager" 2>/dev/null
    [ -n "$server" ] && kill "$server" 2>/dev/null && wait "$server" 2>/dev/null
    rm -rf "$work"
}
trap cleanup EXIT

Xvfb -displayfd 3 -screen 0 1920x1080x24 -nolisten tcp 3>"$work/display" 2>/dev/null &
server=$!
for _ in $(seq 100); do [ -s "$work/display" ] && break; sleep 0.1; done
[ -s "$work/display" ] || { echo "running-chart: Xvfb did not start" >&2; exit 1; }
export DISPLAY=":$(head -n1 "$work/display")" QT_QPA_PLATFORM=xcb
if [ -n "$wm" ]; then
    openbox >/dev/null 2>&1 &
    manager=$!
    sleep 1
fi

NIGHTDOME_FRAME_LOG="$work/frames" "$@" >"$work/out" 2>&1 &
program=$!
window=$(xdotool search --sync --onlyvisible --name '^Nightdome$' | head -1)
xdotool windowmove "$window" 0 19 windowsize "$window" 1920 1061
sleep 0.5
eval "$(xdotool getwindowgeometry --shell "$window")"
echo "chart window: ${WIDTH} x ${HEIGHT}${wm:+ (under $wm)}"
sleep 2
start=$(tail -n1 "$work/frames" | awk '{print $3}')
sleep "$seconds"
kill "$program"
wait "$program" 2>/dev/null || true
program=

python3 - "$work/frames" "$start" <<'PY'
import sys
start = int(sys.argv[2])
events = {}
for line in open(sys.argv[1]):
    parts = line.split()
    if len(parts) != 3:
        continue
    event, chart, us = parts[0], parts[1], int(parts[2])
    if us >= start:
        events.setdefault(event, []).append(us)
for event in ("render", "paint"):
    times = events.get(event, [])
    gaps = sorted(((b - a) / 1000.0, a) for a, b in zip(times, times[1:]))
    if not gaps:
        print(f"{event}: none")
        continue
    values = [g for g, _ in gaps]
    median = values[len(values) // 2]
    p99 = values[min(len(values) - 1, len(values) * 99 // 100)]
    worst = ", ".join(f"{g:.1f} at {(a - start) / 1e6:.2f} s" for g, a in gaps[-5:][::-1])
    print(f"{event}: {len(times)} frames, {len(times) / ((times[-1] - times[0]) / 1e6):.1f}/s; "
          f"gap median {median:.1f} ms, p99 {p99:.1f}, max {values[-1]:.1f} ms (largest: {worst})")
PY
