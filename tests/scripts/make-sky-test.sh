#!/usr/bin/env bash
# Runs scripts/make-sky with a stand-in importer: an import is kept once per machine and reused
# by every build folder and every clone, a changed input or importer imports again, a damaged
# entry is rebuilt, two runs at once import once and both end with whole files, and a failed
# import leaves nothing behind. XDG_CACHE_HOME points into a temporary folder.
#
# Usage: make-sky-test.sh [make-sky-script]   (default: the repository's scripts/make-sky)
set -uo pipefail

make_sky=${1:-$(cd "$(dirname "$0")/../.." && pwd)/scripts/make-sky}
# shellcheck source=cases.sh
. "$(dirname "$0")/cases.sh"

# The stand-in importer: logs its arguments, writes -o FILE with a line per input (the input's
# contents) and FILE's .names beside it, and prints a report. With ND_FAKE_GATE it first says it
# started (ND_FAKE_GATE.started), then waits up to 30 s for ND_FAKE_GATE to exist; with
# ND_FAKE_FAIL it fails after writing half a catalogue.
mkdir -p "$work/importer"
cat > "$work/importer/nightdome-import" <<'EOF'
#!/usr/bin/env bash
echo "import $*" >> "$ND_FAKE_LOG"
if [ -n "${ND_FAKE_GATE:-}" ]; then
    : > "$ND_FAKE_GATE.started"
    for _ in $(seq 600); do
        [ -e "$ND_FAKE_GATE" ] && break
        sleep 0.05
    done
fi
out="" inputs=()
while [ $# -gt 0 ]; do
    case "$1" in
        -o) out=$2 && shift ;;
        --*=*) [ -e "${1#*=}" ] && inputs+=("${1#*=}") ;;
        --*) ;;
        *) inputs+=("$1") ;;
    esac
    shift
done
if [ -n "${ND_FAKE_FAIL:-}" ]; then
    echo "half a catalogue" > "$out"
    echo "nightdome-import: $ND_FAKE_FAIL" >&2
    exit 1
fi
{
    echo "The Sun"
    for input in "${inputs[@]}"; do
        if [ -d "$input" ]; then cat "$input"/*; else cat "$input"; fi
    done
} > "$out"
printf 'nightdome names 1\n%s %s\n' "$(wc -l < "$out")" "$(wc -c < "$out")" > "${out%.dat}.names"
echo "Read ${#inputs[@]} inputs."
echo "Catalogue written to $out"
EOF
chmod +x "$work/importer/nightdome-import"
echo "int main() {}" > "$work/importer/main.cpp"
echo "// the reader" > "$work/importer/Reader.h"

# The inputs as a checkout holds them, and a Gaia folder.
make_inputs()
{
    mkdir -p "$1/data" "$1/gaia"
    echo "Sirius" > "$1/data/Brightest.csv"
    echo "Proxima Centauri" > "$1/data/Nearest.csv"
    echo "586,525 stars" > "$1/gaia/stars_0_0v0_21.cat"
    echo "names" > "$1/gaia/name.fab"
}
make_inputs "$work/checkout"

# Runs make-sky for case_name into build folder $1 with the inputs of checkout $2 (default
# $work/checkout) and the importer's sources in $work/importer. Leaves status, out, err.
run_make_sky()
{
    local build=$1 checkout=${2:-$work/checkout}
    mkdir -p "$work/$case_name"
    out="$work/$case_name/out" err="$work/$case_name/err"
    env XDG_CACHE_HOME="$work/cache" ND_FAKE_LOG="$work/$case_name/log" \
        bash "$make_sky" "$work/importer/nightdome-import" "$work/importer" "$build" -- \
        --format=gaia "$checkout/gaia" --annotate="$checkout/data/Brightest.csv" \
        --add="$checkout/data/Nearest.csv" > "$out" 2> "$err"
    status=$?
}

expect_status()
{
    [ "$status" -eq "$1" ] || fail "exit status $status, expected $1; stderr: $(cat "$err")"
}

expect_in()
{
    grep -qF -- "$1" "$out" || fail "the output lacks \"$1\"; it holds: $(cat "$out")"
}

# How many times the importer ran in this case.
expect_imports()
{
    local got
    got=$(grep -c "^import " "$work/$case_name/log" 2> /dev/null)
    [ "${got:-0}" = "$1" ] || fail "the importer ran ${got:-0} times, expected $1"
}

# Build folder $1 holds stars.dat made from inputs $2 (their lines after the Sun's) and a names
# file whose second line matches it, and nothing else.
expect_sky()
{
    local build=$1 want=$2
    [ "$(cat "$build/stars.dat" 2> /dev/null)" = "The Sun"$'\n'"$want" ] \
        || fail "$build/stars.dat holds \"$(cat "$build/stars.dat" 2> /dev/null)\""
    [ "$(sed -n 2p "$build/stars.names" 2> /dev/null)" \
        = "$(wc -l < "$build/stars.dat") $(wc -c < "$build/stars.dat")" ] \
        || fail "$build/stars.names does not match its stars.dat"
    [ "$(ls -A "$build")" = "stars.dat"$'\n'"stars.names" ] \
        || fail "$build holds $(ls -A "$build")"
}

entries()
{
    (cd "$work/cache/nightdome/sky" && find . -mindepth 1 -maxdepth 1 -type d | sort)
}

sky="names"$'\n'"586,525 stars"$'\n'"Sirius"$'\n'"Proxima Centauri"

# The first build imports and keeps the result with the importer's report.
case_name="miss-then-hit"
run_make_sky "$work/build"
expect_status 0
expect_in "make-sky: sky cache miss: importing into $work/cache/nightdome/sky/"
expect_in "Read 3 inputs."
expect_imports 1
expect_sky "$work/build" "$sky"
entry=$(entries)
[ "$(echo "$entry" | wc -l)" = 1 ] || fail "the cache holds $(entries | tr '\n' ' ')"
for file in stars.dat stars.names report.txt checksums; do
    [ -s "$work/cache/nightdome/sky/$entry/$file" ] || fail "the entry has no $file"
done
grep -qx "Read 3 inputs." "$work/cache/nightdome/sky/$entry/report.txt" \
    || fail "the report is not kept"
# Another build folder of the same checkout: only copied.
run_make_sky "$work/build-asan"
expect_status 0
expect_in "make-sky: sky cache hit: $work/cache/nightdome/sky/${entry#./}"
expect_imports 1
expect_sky "$work/build-asan" "$sky"

# A fresh clone elsewhere with the same contents: the same entry.
case_name="clone-elsewhere"
make_inputs "$work/clone"
run_make_sky "$work/clone-build" "$work/clone"
expect_status 0
expect_in "make-sky: sky cache hit: $work/cache/nightdome/sky/${entry#./}"
expect_imports 0
expect_sky "$work/clone-build" "$sky"

# An input changed: a new key, imported again; the old entry stays for the builds that use it.
case_name="input-changed"
echo "Proxima Centauri and Alpha Centauri" > "$work/clone/data/Nearest.csv"
run_make_sky "$work/clone-build" "$work/clone"
expect_status 0
expect_in "make-sky: sky cache miss"
expect_imports 1
expect_sky "$work/clone-build" "names"$'\n'"586,525 stars"$'\n'"Sirius"$'\n'"Proxima Centauri and Alpha Centauri"
[ "$(entries | wc -l)" = 2 ] || fail "the cache holds $(entries | tr '\n' ' ')"

# A Gaia file changed: the same.
case_name="gaia-file-changed"
echo "586,526 stars" > "$work/clone/gaia/stars_0_0v0_21.cat"
run_make_sky "$work/clone-build" "$work/clone"
expect_in "make-sky: sky cache miss"
expect_imports 1
[ "$(entries | wc -l)" = 3 ] || fail "the cache holds $(entries | tr '\n' ' ')"

# The importer's sources changed: imported again.
case_name="importer-changed"
echo "// the reader, mended" > "$work/importer/Reader.h"
run_make_sky "$work/build"
expect_status 0
expect_in "make-sky: sky cache miss"
expect_imports 1
expect_sky "$work/build" "$sky"
[ "$(entries | wc -l)" = 4 ] || fail "the cache holds $(entries | tr '\n' ' ')"
entry=$(grep -o "/[0-9a-f]*$" "$work/$case_name/out")
entry="$work/cache/nightdome/sky$entry"

# An entry without its stars.names, or with a changed stars.dat: imported again into it.
case_name="damaged-entry"
rm "$entry/stars.names"
run_make_sky "$work/build"
expect_status 0
expect_in "make-sky: sky cache entry $entry is damaged; importing again"
expect_imports 1
expect_sky "$work/build" "$sky"
echo "The Moon" > "$entry/stars.dat"
run_make_sky "$work/build"
expect_in "make-sky: sky cache entry $entry is damaged; importing again"
expect_imports 2
expect_sky "$work/build" "$sky"
[ "$(entries | wc -l)" = 4 ] || fail "the cache holds $(entries | tr '\n' ' ')"

# Two builds at once with a new key: the second waits for the first's import, takes its entry,
# and both end with whole files.
case_name="two-at-once"
mkdir -p "$work/$case_name"
echo "// the reader, mended again" > "$work/importer/Reader.h"
gate="$work/$case_name/gate"
(
    export ND_FAKE_GATE=$gate
    case_name="two-at-once/first"
    run_make_sky "$work/build"
    echo "$status" > "$work/two-at-once/first.status"
) &
first=$!
for _ in $(seq 600); do
    [ -e "$gate.started" ] && break
    sleep 0.05
done
[ -e "$gate.started" ] || fail "the first import did not start"
(
    case_name="two-at-once/second"
    run_make_sky "$work/build-tsan"
    echo "$status" > "$work/two-at-once/second.status"
) &
second=$!
# The second run waits for the lock the first holds while it imports: its make-sky has a
# flock child.
second_waits()
{
    local pid
    for pid in $(pgrep -P "$second"); do
        pgrep -P "$pid" -x flock > /dev/null && return 0
    done
    return 1
}
for _ in $(seq 600); do
    second_waits && break
    sleep 0.05
done
second_waits || fail "the second run did not wait for the lock"
: > "$gate"
wait "$first" "$second"
[ "$(cat "$work/two-at-once/first.status")" = 0 ] || fail "the first run failed"
[ "$(cat "$work/two-at-once/second.status")" = 0 ] || fail "the second run failed"
grep -q "sky cache miss" "$work/two-at-once/first/out" || fail "the first run did not import"
grep -q "sky cache hit" "$work/two-at-once/second/out" || fail "the second run did not take the entry"
[ ! -e "$work/two-at-once/second/log" ] || fail "the second run imported too"
expect_sky "$work/build" "$sky"
expect_sky "$work/build-tsan" "$sky"

# A failed import: its message, a failure, no entry, and the build folder as it was.
case_name="import-fails"
echo "// the reader, broken" > "$work/importer/Reader.h"
before=$(entries)
ND_FAKE_FAIL="stars_0_0v0_21.cat, offset 28: a truncated record" run_make_sky "$work/build"
expect_status 1
grep -qF "nightdome-import: stars_0_0v0_21.cat, offset 28: a truncated record" "$err" \
    || fail "the importer's message is lost: $(cat "$err")"
[ "$(entries)" = "$before" ] || fail "a failed import left an entry"
[ -z "$(find "$work/cache/nightdome/sky" -name '.new.*')" ] || fail "a failed import left its folder"
expect_sky "$work/build" "$sky"

# Only the entries used last are kept: here two, the one just made and the one used before.
case_name="old-entries-go"
run_make_sky "$work/build-asan"
used_before=$(grep -o "/[0-9a-f]*$" "$out")
echo "// the reader, mended once more" > "$work/importer/Reader.h"
ND_SKY_KEEP=2 run_make_sky "$work/build"
expect_in "make-sky: sky cache miss"
made=$(grep -o "/[0-9a-f]*$" "$out")
[ "$(entries)" = "$(printf '.%s\n' "$made" "$used_before" | sort)" ] \
    || fail "the cache holds $(entries | tr '\n' ' '), not ${made#/} and ${used_before#/}"
expect_sky "$work/build" "$sky"

finish make-sky-test
