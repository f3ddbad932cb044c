#!/usr/bin/env bash
# Runs scripts/setup against stand-ins for dpkg-query, apt-get, dpkg-deb, id and sudo, so that
# the branches a fully installed machine never takes run here: packages missing as root, through
# sudo and with neither, and the three ways to the star catalogue. The PATH holds only the
# stand-ins and a few harmless real tools, so no real apt-get or sudo can ever be reached, and
# HOME, XDG_CACHE_HOME and TMPDIR point into a temporary folder.
#
# Usage: setup-test.sh [setup-script]   (default: the repository's scripts/setup)
set -uo pipefail

setup=${1:-$(cd "$(dirname "$0")/../.." && pwd)/scripts/setup}
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
failures=0
case_name=""

fail()
{
    echo "FAIL [$case_name]: $*" >&2
    failures=$((failures + 1))
}

# The real tools the set-up script and the stand-ins use; nothing else is on their PATH.
mkdir -p "$work/tools" "$work/fakes" "$work/sudo"
for tool in bash env grep mkdir mktemp chmod rm tar mv cat; do
    real=$(command -v "$tool") || {
        echo "setup-test: $tool not found" >&2
        exit 1
    }
    ln -s "$real" "$work/tools/$tool"
done

# dpkg-query -W -f='${Status}' PACKAGE: installed unless PACKAGE is in ND_FAKE_MISSING.
cat > "$work/fakes/dpkg-query" <<'EOF'
#!/usr/bin/env bash
package=${!#}
for m in $ND_FAKE_MISSING; do
    [ "$m" = "$package" ] && exit 1
done
printf 'install ok installed'
EOF

# id -u: ND_FAKE_UID.
cat > "$work/fakes/id" <<'EOF'
#!/usr/bin/env bash
[ "${1:-}" = -u ] && echo "$ND_FAKE_UID"
EOF

# apt-get: logs how it was reached (through sudo or not), the DEBIAN_FRONTEND it saw and its
# arguments. "download" leaves an archive in the current folder, except while the package
# lists are stale (ND_FAKE_LISTS=stale) and no "update" has run yet.
cat > "$work/fakes/apt-get" <<'EOF'
#!/usr/bin/env bash
echo "apt-get${ND_FAKE_VIA_SUDO:+ (sudo)} [${DEBIAN_FRONTEND:-}] $*" >> "$ND_FAKE_LOG"
case "${1:-}" in
    update) echo done > "$ND_FAKE_STATE/updated" ;;
    download)
        if [ "${ND_FAKE_LISTS:-}" = stale ] && [ ! -e "$ND_FAKE_STATE/updated" ]; then
            echo "E: Unable to locate package kstars-data" >&2
            exit 100
        fi
        echo "an archive" > kstars-data_3.6.0-1_all.deb
        ;;
esac
exit 0
EOF

# dpkg-deb --fsys-tarfile ARCHIVE: a tar stream holding ./usr/share/kstars/stars.dat.
cat > "$work/fakes/dpkg-deb" <<'EOF'
#!/usr/bin/env bash
echo "dpkg-deb $*" >> "$ND_FAKE_LOG"
[ "${1:-}" = --fsys-tarfile ] && [ -f "${2:-}" ] || exit 2
tree=$(mktemp -d)
mkdir -p "$tree/usr/share/kstars"
echo "a catalogue" > "$tree/usr/share/kstars/stars.dat"
tar -c -C "$tree" ./usr/share/kstars/stars.dat
rm -rf "$tree"
EOF

# sudo: like the real one it resets the environment; the command's own VAR=value arguments
# and what the stand-ins need come through.
cat > "$work/sudo/sudo" <<'EOF'
#!/usr/bin/env bash
echo "sudo $*" >> "$ND_FAKE_LOG"
exec env -i PATH="$PATH" ND_FAKE_LOG="$ND_FAKE_LOG" ND_FAKE_STATE="$ND_FAKE_STATE" \
    ND_FAKE_LISTS="${ND_FAKE_LISTS:-}" ND_FAKE_VIA_SUDO=1 "$@"
EOF
chmod +x "$work/fakes/"* "$work/sudo/sudo"

# Runs the set-up script for case_name with: uid, sudo (yes/no), missing (package names),
# lists (fresh/stale), system_catalogue (yes/no), xdg (yes/no). Leaves status, dir (the case's
# folder: home/, xdg/, tmp/, log, out, err) and cache (where the catalogue is to be cached).
run_setup()
{
    dir="$work/$case_name"
    mkdir -p "$dir/home" "$dir/tmp" "$dir/state" "$dir/system"
    : > "$dir/log"
    local path="$work/fakes:$work/tools"
    [ "$sudo" = yes ] && path="$work/sudo:$path"
    [ "$system_catalogue" = yes ] && echo "installed catalogue" > "$dir/system/stars.dat"
    local xdg_env=()
    if [ "$xdg" = yes ]; then
        xdg_env=(XDG_CACHE_HOME="$dir/xdg")
        cache="$dir/xdg/nightdome/kstars"
    else
        cache="$dir/home/.cache/nightdome/kstars"
    fi
    env -i PATH="$path" HOME="$dir/home" TMPDIR="$dir/tmp" "${xdg_env[@]}" \
        ND_SYSTEM_CATALOGUE="$dir/system/stars.dat" \
        ND_FAKE_LOG="$dir/log" ND_FAKE_STATE="$dir/state" ND_FAKE_UID="$uid" \
        ND_FAKE_MISSING="$missing" ND_FAKE_LISTS="$lists" \
        "$work/tools/bash" "$setup" > "$dir/out" 2> "$dir/err"
    status=$?
}

expect_status()
{
    [ "$status" -eq "$1" ] || fail "exit status $status, expected $1; stderr: $(cat "$dir/err")"
}

# The log's lines that start with $1 must be exactly the remaining arguments, in order.
expect_calls()
{
    local prefix=$1
    shift
    local got want=""
    got=$(grep "^$prefix" "$dir/log")
    [ $# -gt 0 ] && want=$(printf '%s\n' "$@")
    [ "$got" = "${want%$'\n'}" ] || fail "calls of $prefix were:"$'\n'"$got"$'\n'"expected:"$'\n'"$want"
}

expect_in()
{
    grep -qF -- "$2" "$dir/$1" || fail "$1 lacks \"$2\"; it holds: $(cat "$dir/$1")"
}

expect_file()
{
    if [ ! -f "$1" ]; then
        fail "no file $1"
    elif [ "$(cat "$1")" != "$2" ]; then
        fail "$1 holds \"$(cat "$1")\", expected \"$2\""
    fi
}

expect_no_file()
{
    [ ! -e "$1" ] || fail "$1 should not exist"
}

expect_empty_tmp()
{
    [ -z "$(ls -A "$dir/tmp")" ] || fail "the download folder was left behind in $dir/tmp"
}

# As root, with sudo available too: apt-get directly, the lists first, then exactly the
# missing packages.
case_name="root-installs-what-is-missing"
uid=0 sudo=yes missing="cmake xdotool desktop-file-utils appstream" lists=fresh system_catalogue=yes xdg=no
run_setup
expect_status 0
expect_calls "apt-get" \
    "apt-get [noninteractive] update -q" \
    "apt-get [noninteractive] install -y -q --no-install-recommends cmake xdotool desktop-file-utils appstream"
expect_calls "sudo"
expect_in out "setup: installing cmake xdotool desktop-file-utils appstream"
expect_in out "setup: star catalogue: $dir/system/stars.dat"

# Not root, sudo available: both apt-get calls go through sudo, which must be told the
# non-interactive front end itself because it resets the environment.
case_name="sudo-installs-what-is-missing"
uid=1000 sudo=yes missing="libgtest-dev fonts-ocr-a" lists=fresh system_catalogue=yes xdg=no
run_setup
expect_status 0
expect_calls "apt-get" \
    "apt-get (sudo) [noninteractive] update -q" \
    "apt-get (sudo) [noninteractive] install -y -q --no-install-recommends libgtest-dev fonts-ocr-a"
expect_calls "sudo" \
    "sudo DEBIAN_FRONTEND=noninteractive apt-get update -q" \
    "sudo DEBIAN_FRONTEND=noninteractive apt-get install -y -q --no-install-recommends libgtest-dev fonts-ocr-a"

# Neither root nor sudo: a message naming the packages, exit 1, and no apt-get at all.
case_name="neither-root-nor-sudo"
uid=1000 sudo=no missing="qt6-base-dev xvfb" lists=fresh system_catalogue=no xdg=no
run_setup
expect_status 1
expect_in err "neither root nor sudo"
expect_in err "qt6-base-dev xvfb"
expect_calls "apt-get"
expect_no_file "$cache/stars.dat"

# Everything installed, no catalogue anywhere: the archive is downloaded as the user (no root
# needed) and its one file lands in XDG_CACHE_HOME.
case_name="catalogue-fetched-into-the-xdg-cache"
uid=1000 sudo=no missing="" lists=fresh system_catalogue=no xdg=yes
run_setup
expect_status 0
expect_in out "setup: all packages present"
expect_calls "apt-get" "apt-get [noninteractive] download -q kstars-data"
unpacked=$(grep "^dpkg-deb" "$dir/log")
[[ $unpacked == "dpkg-deb --fsys-tarfile $dir/tmp/"*/kstars-data_3.6.0-1_all.deb ]] \
    || fail "dpkg-deb did not read the downloaded archive: $unpacked"
expect_file "$cache/stars.dat" "a catalogue"
expect_no_file "$cache/stars.dat.part"
expect_no_file "$dir/home/.cache"
expect_in out "setup: star catalogue: $cache/stars.dat"
expect_empty_tmp

# A catalogue already cached under HOME: nothing is fetched.
case_name="catalogue-already-cached"
uid=1000 sudo=no missing="" lists=fresh system_catalogue=no xdg=no
mkdir -p "$work/$case_name/home/.cache/nightdome/kstars"
echo "cached before" > "$work/$case_name/home/.cache/nightdome/kstars/stars.dat"
run_setup
expect_status 0
expect_calls "apt-get"
expect_calls "dpkg-deb"
expect_file "$cache/stars.dat" "cached before"
expect_in out "setup: star catalogue: $cache/stars.dat"

# Stale package lists as root: the first download fails, the lists are fetched, the second
# download succeeds.
case_name="catalogue-after-fetching-the-lists-as-root"
uid=0 sudo=no missing="" lists=stale system_catalogue=no xdg=no
run_setup
expect_status 0
expect_calls "apt-get" \
    "apt-get [noninteractive] download -q kstars-data" \
    "apt-get [noninteractive] update -q" \
    "apt-get [noninteractive] download -q kstars-data"
expect_file "$cache/stars.dat" "a catalogue"
expect_empty_tmp

# Stale lists and neither root nor sudo: a clear message and exit 1, no half-made catalogue.
case_name="catalogue-without-lists-or-root"
uid=1000 sudo=no missing="" lists=stale system_catalogue=no xdg=no
run_setup
expect_status 1
expect_in err "cannot fetch the package lists"
expect_calls "apt-get" "apt-get [noninteractive] download -q kstars-data"
expect_no_file "$cache/stars.dat"
expect_no_file "$cache/stars.dat.part"
expect_empty_tmp

if [ "$failures" -ne 0 ]; then
    echo "setup-test: $failures failed checks" >&2
    exit 1
fi
echo "setup-test: all cases passed"
