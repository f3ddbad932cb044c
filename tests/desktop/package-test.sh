#!/usr/bin/env bash
# The Debian package as a user gets it: made from the built tree with one command, it holds what
# `cmake --install` installs (with what Debian adds: the copyright, the changelog, lintian's
# overrides, and the manual pages gzipped), depends on the Qt packages that dpkg-shlibdeps found
# from its binaries, unpacks into a root of its own whose program names its sky and finds it
# beside itself, and lintian reports neither an error nor a warning that is not overridden with
# its reason. Leaves the unpacked root in WORK/root for the test that starts it on a display.
# Usage: <build folder> <work folder> <version>
set -uo pipefail
build=$1 work=$2 version=$3
status=0
fail() {
    echo "FAIL: $*" >&2
    status=1
}

# What makes and checks the package (scripts/setup installs them).
for tool in cpack dpkg-deb dpkg-shlibdeps lintian objcopy objdump readelf; do
    command -v "$tool" >/dev/null || {
        echo "FAIL: $tool is not installed (scripts/setup installs it)" >&2
        exit 1
    }
done

rm -rf "$work"
mkdir -p "$work"
if ! cpack --config "$build/CPackConfig.cmake" -B "$work" >"$work/cpack.log" 2>&1; then
    cat "$work/cpack.log" >&2
    echo "FAIL: cpack" >&2
    exit 1
fi
arch=$(dpkg --print-architecture)
deb="$work/nightdome_${version}_${arch}.deb"
if [ ! -s "$deb" ]; then
    ls "$work" >&2
    echo "FAIL: cpack made no $(basename "$deb")" >&2
    exit 1
fi
echo "made $deb ($(stat -c %s "$deb") bytes)"

# The control fields a package manager and a software centre show.
field() { dpkg-deb -f "$deb" "$1"; }
[ "$(field Package)" = nightdome ] || fail "the package is called '$(field Package)'"
[ "$(field Version)" = "$version" ] || fail "the package's version is '$(field Version)'"
[ "$(field Architecture)" = "$arch" ] || fail "the package's architecture is '$(field Architecture)'"
[ "$(field Section)" = science ] || fail "the package's section is '$(field Section)'"
[ "$(field Priority)" = optional ] || fail "the package's priority is '$(field Priority)'"
grep -qE '^[^<]+ <[^@> ]+@[^> ]+>$' <<<"$(field Maintainer)" \
    || fail "the maintainer '$(field Maintainer)' is not a name and an address"
[ -n "$(field Homepage)" ] || fail "the package names no home page"
[ "$(field Description | wc -l)" -gt 3 ] || fail "the package has no long description"

# What `cmake --install` puts out, each path as the package holds it under /usr.
prefix="$work/install"
if ! cmake --install "$build" --prefix "$prefix" >"$work/install.log" 2>&1; then
    cat "$work/install.log" >&2
    echo "FAIL: cmake --install" >&2
    exit 1
fi
(cd "$prefix" && find . -type f | sed 's|^\./|./usr/|') \
    | sed 's|^\(\./usr/share/man/man[1-9]/.*\.[1-9]\)$|\1.gz|' >"$work/expected"
cat >>"$work/expected" <<'EOF'
./usr/share/doc/nightdome/copyright
./usr/share/doc/nightdome/changelog.gz
./usr/share/lintian/overrides/nightdome
EOF
sort -o "$work/expected" "$work/expected"
dpkg-deb --fsys-tarfile "$deb" | tar -t | grep -v '/$' | sort >"$work/packaged"
if ! diff -u "$work/expected" "$work/packaged" >"$work/contents.diff"; then
    cat "$work/contents.diff" >&2
    fail "the package does not hold what cmake --install installs (- missing, + extra)"
fi

root="$work/root"
dpkg-deb -x "$deb" "$root" || fail "dpkg-deb -x"
cmp -s "$root/usr/share/nightdome/stars.dat" "$prefix/share/nightdome/stars.dat" \
    || fail "the packaged stars.dat is not the one the build made"
cmp -s "$root/usr/share/nightdome/stars.names" "$prefix/share/nightdome/stars.names" \
    || fail "the packaged stars.names is not the one the build made"
zcat "$root/usr/share/man/man1/nightdome.1.gz" | grep -qF '/usr/share/nightdome/stars.dat' \
    || fail "nightdome(1) does not name /usr/share/nightdome/stars.dat, where the package puts it"
head -n 1 "$root/usr/share/doc/nightdome/copyright" \
    | grep -qx 'Format: https://www.debian.org/doc/packaging-manuals/copyright-format/1.0/' \
    || fail "the copyright file is not in Debian's machine-readable form"
zcat "$root/usr/share/doc/nightdome/changelog.gz" | head -n 1 | grep -q "^nightdome ($version) " \
    || fail "the changelog's last entry is not version $version"

# Stripped binaries, whose Qt libraries all belong to packages the package depends on, with the
# lowest versions dpkg-shlibdeps worked out.
depends=$(field Depends)
echo "Depends: $depends"
for program in nightdome nightdome-import; do
    binary="$root/usr/bin/$program"
    [ -x "$binary" ] || {
        fail "usr/bin/$program is not in the package"
        continue
    }
    readelf -S "$binary" | grep -q '\.debug_info' && fail "usr/bin/$program is not stripped"
    for library in $(objdump -p "$binary" | awk '$1 == "NEEDED" && $2 ~ /^libQt6/ {print $2}'); do
        path=$(ldconfig -p | awk -v lib="$library" '$1 == lib {print $NF; exit}')
        owner=$(dpkg -S "$(readlink -f "$path")" 2>/dev/null | head -n 1 | cut -d: -f1)
        [ -n "$owner" ] || {
            fail "no Debian package holds $library, which $program needs"
            continue
        }
        grep -qE "(^|, )$owner \(>= [0-9][^)]*\)(,|$)" <<<"$depends" \
            || fail "Depends does not name $owner (with a version), which holds $library"
    done
done
grep -q 'libqt6widgets6' <<<"$depends" || fail "Depends names no Qt Widgets package"

# The unpacked program, from another folder with no display and every data folder but its own
# empty: it names the sky it was built with, and a start finds that sky beside itself.
elsewhere=$(mktemp -d)
trap 'rm -rf "$elsewhere"' EXIT
mkdir -p "$elsewhere/data-home" "$elsewhere/data-dirs"
run() {
    (cd "$elsewhere" && env -u DISPLAY -u WAYLAND_DISPLAY QT_QPA_PLATFORM=offscreen \
        XDG_DATA_HOME="$elsewhere/data-home" XDG_DATA_DIRS="$elsewhere/data-dirs" "$@")
}
version_lines=$(run "$root/usr/bin/nightdome" --version)
[ "$(head -n 1 <<<"$version_lines")" = "nightdome $version" ] \
    || fail "the packaged nightdome --version says '$(head -n 1 <<<"$version_lines")'"
sky=$(sed -n 's/^Sky: //p' <<<"$version_lines")
grep -qE "\((stellarium|kstars)-data" <<<"$sky" || fail "the packaged program names no sky: $sky"
grep -qF "$sky" <<<"$(field Description)" || fail "the description does not name the sky '$sky'"
run "$root/usr/bin/nightdome-import" --help >/dev/null || fail "the packaged nightdome-import --help"

# lintian's errors and warnings fail the test; its overrides carry their reasons.
lintian --fail-on error,warning "$deb" >"$work/lintian.log" 2>&1
code=$?
grep -v '^running with root privileges' "$work/lintian.log"
[ $code -eq 0 ] || fail "lintian reports errors or warnings (status $code)"
overrides="$root/usr/share/lintian/overrides/nightdome"
if [ ! -s "$overrides" ]; then
    fail "the package holds no lintian overrides"
elif ! awk '/^#/ {reason = 1; next} /^[^[:space:]]/ {if (!reason) bad++; reason = 0}
        END {exit bad > 0}' "$overrides"; then
    fail "a lintian override has no comment above it saying why"
fi

[ $status -eq 0 ] && echo "the package $deb holds the installation and passes lintian"
exit $status
