#!/usr/bin/env bash
# `cmake --install` into a fresh prefix puts every file where a desktop looks for it, and the
# installed commands answer --help and --version, and refuse an unknown option, from another
# folder and without a display. Usage: <build folder> <prefix> <desktop id> <version>
set -uo pipefail
build=$1 prefix=$2 id=$3 version=$4
status=0
fail() {
    echo "FAIL: $*" >&2
    status=1
}

rm -rf "$prefix"
if ! cmake --install "$build" --prefix "$prefix" >"$build/install-test.log" 2>&1; then
    cat "$build/install-test.log" >&2
    echo "FAIL: cmake --install" >&2
    exit 1
fi

for program in nightdome nightdome-import; do
    [ -x "$prefix/bin/$program" ] || fail "bin/$program is not installed"
done
catalogue="$prefix/share/nightdome/stars.dat"
if [ ! -s "$catalogue" ]; then
    fail "share/nightdome/stars.dat is not installed"
elif [ "$(head -n 1 "$catalogue")" != "The Sun" ]; then
    fail "the installed catalogue does not start with the Sun"
elif [ "$(sed -n 2p "${catalogue%.dat}.names" 2>/dev/null | cut -d' ' -f2)" != "$(wc -c <"$catalogue")" ]; then
    fail "share/nightdome/stars.names is not installed beside the stars.dat it belongs to"
fi

entry="$prefix/share/applications/$id.desktop"
metainfo="$prefix/share/metainfo/$id.metainfo.xml"
[ -s "$entry" ] || fail "no desktop entry $entry"
[ -s "$metainfo" ] || fail "no metainfo $metainfo"
desktop-file-validate "$entry" || fail "desktop-file-validate $entry"
appstreamcli validate --no-net "$metainfo" >/dev/null || fail "appstreamcli validate $metainfo"
grep -qx "Icon=$id" "$entry" || fail "the desktop entry's icon is not $id"
exec_line=$(sed -n 's/^Exec=\([^ ]*\).*/\1/p' "$entry")
[ -x "$prefix/bin/$exec_line" ] || fail "the desktop entry starts '$exec_line', not an installed program"
grep -q "<launchable type=\"desktop-id\">$id.desktop</launchable>" "$metainfo" \
    || fail "the metainfo does not launch $id.desktop"
grep -q "<screenshot type=\"default\">" "$metainfo" || fail "the metainfo has no screenshot"

# Every icon size, a PNG of exactly that many pixels a side (the IHDR chunk's width and height).
for size in 16 32 48 64 128 256; do
    icon="$prefix/share/icons/hicolor/${size}x${size}/apps/$id.png"
    if [ ! -s "$icon" ]; then
        fail "no ${size}x${size} icon"
        continue
    fi
    [ "$(head -c 8 "$icon" | od -An -tx1 | tr -d ' \n')" = "89504e470d0a1a0a" ] \
        || fail "$icon is not a PNG"
    read -r w1 w2 w3 w4 h1 h2 h3 h4 < <(od -An -tu1 -j16 -N8 "$icon")
    width=$(((w1 << 24) | (w2 << 16) | (w3 << 8) | w4))
    height=$(((h1 << 24) | (h2 << 16) | (h3 << 8) | h4))
    [ "$width" = "$size" ] && [ "$height" = "$size" ] \
        || fail "$icon is ${width}x${height}, not ${size}x${size}"
done

for page in nightdome nightdome-import; do
    [ -s "$prefix/share/man/man1/$page.1" ] || fail "no manual page $page(1)"
done
[ -s "$prefix/share/doc/nightdome/COPYING" ] || fail "the licence is not installed"
[ -s "$prefix/share/doc/nightdome/southern-stars/README.md" ] \
    || fail "the star data's credit is not installed"
# The Gaia data of the default sky is credited with its licence wherever the data is.
for credit in "ESA/Gaia/DPAC" "CC BY-SA 3.0 IGO"; do
    grep -qF "$credit" "$prefix/share/doc/nightdome/README.md" \
        || fail "the installed README does not say \"$credit\""
    grep -qF "${credit//-/\\-}" "$prefix/share/man/man1/nightdome.1" \
        || fail "nightdome(1) does not say \"$credit\""
done
grep -q "<project_license>.*CC-BY-SA-3.0-IGO</project_license>" "$metainfo" \
    || fail "the metainfo's licence leaves out the Gaia data's"

# The installed commands, from another folder and with no display to connect to.
elsewhere=$(mktemp -d)
trap 'rm -rf "$elsewhere"' EXIT
run() {
    (cd "$elsewhere" && env -u DISPLAY -u WAYLAND_DISPLAY -u QT_QPA_PLATFORM "$@")
}
help=$(run "$prefix/bin/nightdome" --help)
[ $? -eq 0 ] || fail "nightdome --help failed"
for option in --catalogue --generate --threads --help --version; do
    grep -q -- "$option" <<<"$help" || fail "nightdome --help does not mention $option"
done
version_lines=$(run "$prefix/bin/nightdome" --version)
[ "$(head -n 1 <<<"$version_lines")" = "nightdome $version" ] \
    || fail "nightdome --version does not print 'nightdome $version'"
grep -qE "^Sky: .*\((stellarium|kstars)-data.*\)" <<<"$version_lines" \
    || fail "nightdome --version does not name the sky: $version_lines"
error=$(run "$prefix/bin/nightdome" --bogus 2>&1 >/dev/null)
code=$?
[ $code -eq 2 ] || fail "nightdome --bogus exits with $code, not 2"
grep -q "bogus" <<<"$error" || fail "nightdome --bogus does not name the option: $error"
run "$prefix/bin/nightdome-import" --help >/dev/null || fail "nightdome-import --help failed"

[ $status -eq 0 ] && echo "installed into $prefix: all files in place"
exit $status
