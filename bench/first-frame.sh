#!/usr/bin/env bash
# How long the program takes from its launch to the first frame of its chart on the screen.
# Runs under scripts/with-xvfb (an X server of its own): starts the program, waits for its
# chart window ("Nightdome") to appear, then takes pictures of that window as fast as xwd
# can until the chart has drawn a frame (the window mostly black sky with stars, where a
# window not yet painted is grey), and prints the milliseconds from the launch to that
# picture. Repeats the launch and prints every time and the median.
#
# Usage: bench/first-frame.sh [--runs=N] PROGRAM [PROGRAM'S OPTIONS...]
#   e.g. scripts/with-xvfb bench/first-frame.sh --runs=9 build/app/nightdome
# ND_FIRST_FRAME_SHOT=FILE keeps the picture that counted (xwd format) for looking at.
set -euo pipefail

runs=5
if [[ "${1:-}" == --runs=* ]]; then
    runs=${1#--runs=}
    shift
fi
[ $# -ge 1 ] || {
    echo "usage: $0 [--runs=N] PROGRAM [OPTIONS...]" >&2
    exit 2
}
[ -n "${DISPLAY:-}" ] || {
    echo "first-frame: no DISPLAY; run it under scripts/with-xvfb" >&2
    exit 2
}

shot=$(mktemp)
trap 'rm -f "$shot"' EXIT

# Whether the window picture in $shot shows a drawn chart: at least half its pixels pure
# black and at least 20 bright ones (stars, the read-out).
drawn()
{
    python3 - "$shot" <<'EOF'
import struct, sys
d = open(sys.argv[1], 'rb').read()
if len(d) < 100:
    sys.exit(1)
h = struct.unpack('>25I', d[:100])
header, width, height, bpl, ncolours = h[0], h[4], h[5], h[12], h[19]
pixels = d[header + 12 * ncolours:]
black = bright = total = 0
for y in range(0, height, 2):
    row = pixels[y * bpl:y * bpl + 4 * width]
    for x in range(0, 4 * width, 8):
        b, g, r = row[x], row[x + 1], row[x + 2]
        total += 1
        if r == g == b == 0:
            black += 1
        elif r + g + b > 300 and not (r == g == b):
            bright += 1
        elif r + g + b > 450 and r == g == b and black > 0:
            bright += 1
sys.exit(0 if total and black * 2 >= total and bright >= 20 else 1)
EOF
}

times=()
for run in $(seq "$runs"); do
    start=$(date +%s%N)
    "$@" >/dev/null 2>&1 &
    program=$!
    window=$(xdotool search --sync --onlyvisible --name '^Nightdome$' | head -1)
    while :; do
        xwd -silent -id "$window" >"$shot" 2>/dev/null || true
        now=$(date +%s%N)
        if drawn; then
            [ -n "${ND_FIRST_FRAME_SHOT:-}" ] && cp "$shot" "$ND_FIRST_FRAME_SHOT"
            break
        fi
        if [ $(((now - start) / 1000000)) -gt 20000 ]; then
            echo "first-frame: no chart drawn within 20 s" >&2
            kill "$program"
            exit 1
        fi
    done
    ms=$(((now - start) / 1000000))
    times+=("$ms")
    echo "run $run: first frame after $ms ms"
    kill "$program"
    wait "$program" 2>/dev/null || true
done
median=$(printf '%s\n' "${times[@]}" | sort -n | sed -n "$(((runs + 1) / 2))p")
echo "median of $runs: $median ms (all: ${times[*]})"
