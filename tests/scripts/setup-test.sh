#!/usr/bin/env bash
# Runs scripts/setup against stand-ins for dpkg-query, apt-get, dpkg-deb, id and sudo, so that
# the branches a fully installed machine never takes run here: packages missing as root, through
# sudo and with neither, the three ways to the star catalogue, and the Gaia catalogue fetched
# through a private apt configuration, found in the cache, found damaged or partial, or not to be
# had. The PATH holds only the stand-ins and a few harmless real tools, so no real apt-get or
# sudo can ever be reached, and HOME, XDG_CACHE_HOME, TMPDIR and the apt sources the set-up reads
# point into a temporary folder.
#
# Usage: setup-test.sh [setup-script]   (default: the repository's scripts/setup)
set -uo pipefail

setup=${1:-$(cd "$(dirname "$0")/../.." && pwd)/scripts/setup}
# shellcheck source=cases.sh
. "$(dirname "$0")/cases.sh"

# The real tools the set-up script and the stand-ins use; nothing else is on their PATH.
mkdir -p "$work/tools" "$work/fakes" "$work/sudo"
for tool in bash env grep mkdir mktemp chmod rm tar mv cat md5sum awk; do
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
# Given a source list of its own (-o Dir::Etc::SourceList=FILE) it stands for the archive that
# list names: "update" logs the list's line and leaves a file in the lists folder, or fails when
# ND_FAKE_ARCHIVE=unreachable; "download stellarium-data" then leaves the package that
# ND_FAKE_SUITES ("SUITE=KIND:VERSION ...", KIND a folder of ND_FAKE_PACKAGES) puts in that
# suite, or fails when the suite has none.
cat > "$work/fakes/apt-get" <<'EOF'
#!/usr/bin/env bash
echo "apt-get${ND_FAKE_VIA_SUDO:+ (sudo)} [${DEBIAN_FRONTEND:-}] $*" >> "$ND_FAKE_LOG"
sources="" lists="" verb="" after_o=no
for argument in "$@"; do
    if [ "$after_o" = yes ]; then
        case "$argument" in
            Dir::Etc::SourceList=*) sources=${argument#*=} ;;
            Dir::State::Lists=*) lists=${argument#*=} ;;
        esac
        after_o=no
    elif [ "$argument" = -o ]; then
        after_o=yes
    elif [ -z "$verb" ] && [[ $argument != -* ]]; then
        verb=$argument
    fi
done
if [ -n "$sources" ]; then
    case "$verb" in
        update)
            echo "sources: $(cat "$sources")" >> "$ND_FAKE_LOG"
            if [ "${ND_FAKE_ARCHIVE:-}" = unreachable ]; then
                echo "E: Failed to fetch $sources: could not resolve the host" >&2
                exit 100
            fi
            read -r -a words < "$sources"
            echo "${words[-2]}" > "$lists/suite"
            ;;
        download)
            suite=$(cat "$lists/suite")
            for entry in ${ND_FAKE_SUITES:-}; do
                if [ "${entry%%=*}" = "$suite" ]; then
                    kind=${entry#*=}
                    echo "${kind%%:*}" > "stellarium-data_${kind#*:}_all.deb"
                    exit 0
                fi
            done
            echo "E: Unable to locate package stellarium-data" >&2
            exit 100
            ;;
    esac
    exit 0
fi
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

# dpkg-deb --fsys-tarfile ARCHIVE: for kstars-data a tar stream holding
# ./usr/share/kstars/stars.dat; for stellarium-data the tree of the package the archive names
# (ND_FAKE_PACKAGES/KIND/data), whose --ctrl-tarfile holds its md5sums and whose --field Version
# is the one in its file name.
cat > "$work/fakes/dpkg-deb" <<'EOF'
#!/usr/bin/env bash
echo "dpkg-deb $*" >> "$ND_FAKE_LOG"
[ -f "${2:-}" ] || exit 2
name=${2##*/}
if [[ $name == stellarium-data_* ]]; then
    kind=$(cat "$2")
    case "$1" in
        --field) version=${name#stellarium-data_} && echo "${version%_all.deb}" ;;
        --ctrl-tarfile) tar -c -C "$ND_FAKE_PACKAGES/$kind/control" ./md5sums ;;
        --fsys-tarfile) tar -c -C "$ND_FAKE_PACKAGES/$kind/data" . ;;
        *) exit 2 ;;
    esac
    exit 0
fi
[ "${1:-}" = --fsys-tarfile ] || exit 2
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

# The stellarium-data packages the fake archive serves, each as data/ (its files) and
# control/md5sums: "gaia" carries the Gaia catalogue beside files the set-up must leave out,
# "old" only the older catalogue of stable's packages, "mismatch" a star file that differs from
# what defaultStarsConfig.json says of it.
make_package()
{
    local kind=$1 config_sum=$2
    local data="$work/packages/$kind/data"
    local stars="$data/usr/share/stellarium/stars/hip_gaia3"
    mkdir -p "$stars" "$data/usr/share/stellarium/skycultures/western" "$work/packages/$kind/control"
    echo "the brightest stars" > "$stars/stars_0_0v0_21.cat"
    echo "the fainter stars" > "$stars/stars_1_0v0_16.cat"
    echo "spectral types" > "$stars/stars_hip_sp_0v0_6.cat"
    echo "Bayer and Flamsteed" > "$stars/name.fab"
    echo "cross-identifications" > "$stars/cross-id.cat"
    echo "variable stars" > "$stars/gcvs.cat"
    echo "IAU names" > "$data/usr/share/stellarium/skycultures/common_star_names.fab"
    echo "constellations" > "$data/usr/share/stellarium/skycultures/western/index.json"
    local sum0 sum1
    sum0=$(md5sum < "$stars/stars_0_0v0_21.cat")
    sum1=${config_sum:-$(md5sum < "$stars/stars_1_0v0_16.cat")}
    cat > "$stars/defaultStarsConfig.json" <<EOF
{
	"catalogs":
	[
		{
			"fileName": "stars_0_0v0_21.cat",
			"checksum": "${sum0%% *}",
			"checked": true
		},
		{
			"fileName": "stars_1_0v0_16.cat",
			"checksum": "${sum1%% *}",
			"checked": true
		},
		{
			"fileName": "stars_4_1v0_6.cat",
			"checksum": "f5e57f400291d3d0c247ec669b1a4a07",
			"checked": false
		}
	]
}
EOF
    (cd "$data" && find usr -type f | sort | while read -r file; do
        echo "$(md5sum < "$file" | cut -d' ' -f1)  $file"
    done) > "$work/packages/$kind/control/md5sums"
}
make_package gaia ""
make_package mismatch 0123456789abcdef0123456789abcdef
mkdir -p "$work/packages/old/data/usr/share/stellarium/stars/default" "$work/packages/old/control"
echo "Hipparcos and Tycho" > "$work/packages/old/data/usr/share/stellarium/stars/default/stars_0_0v2.cat"
echo "$(md5sum < "$work/packages/old/data/usr/share/stellarium/stars/default/stars_0_0v2.cat" \
    | cut -d' ' -f1)  usr/share/stellarium/stars/default/stars_0_0v2.cat" \
    > "$work/packages/old/control/md5sums"
# What the set-up keeps of the "gaia" package, with "package" and "complete".
gaia_files="common_star_names.fab complete cross-id.cat defaultStarsConfig.json name.fab package"
gaia_files+=" stars_0_0v0_21.cat stars_1_0v0_16.cat stars_hip_sp_0v0_6.cat"

# The apt sources a machine may have: "deb822" as Debian writes them today, with a foreign
# archive, the security archive and a disabled entry ahead of the main archive; "list" the
# older one-line form, with comments, source packages and the security suite first; "none".
mkdir -p "$work/apt/deb822/sources.list.d" "$work/apt/list" "$work/apt/none"
cat > "$work/apt/deb822/sources.list.d/debian.sources" <<'EOF'
Types: deb
URIs: https://deb.nodesource.com/node_20.x
Suites: nodistro
Components: main
Signed-By: /usr/share/keyrings/nodesource.gpg

Types: deb
# the security archive comes first on some machines
URIs: http://mirror.example/debian-security
Suites: bookworm-security
Components: main
Signed-By: /usr/share/keyrings/debian-archive-keyring.gpg

Types: deb
URIs: http://disabled.example/debian
Suites: bookworm
Components: main
Enabled: no

Types: deb deb-src
URIs: http://mirror.example/debian
Suites: bookworm bookworm-updates
Components: main contrib
Signed-By: /usr/share/keyrings/debian-archive-keyring.gpg
EOF
echo "deb http://ignored.example/debian bookworm main" \
    > "$work/apt/deb822/sources.list.d/old.list.disabled-by-admin"
cat > "$work/apt/list/sources.list" <<'EOF'
# deb http://commented.example/debian bookworm main
deb-src http://source.example/debian bookworm main
deb http://mirror.example/debian bookworm-security main
deb http://mirror.example/debian bookworm contrib
deb [arch=amd64 signed-by=/etc/apt/keyrings/debian.gpg] http://ftp.example.org/debian/ bookworm main
EOF

# Runs the set-up script for case_name with: uid, sudo (yes/no), missing (package names),
# lists (fresh/stale), system_catalogue (yes/no), xdg (yes/no), and for the Gaia catalogue
# apt_sources (a folder of $work/apt; none unless set), suites (ND_FAKE_SUITES) and archive
# (reachable/unreachable), which are reset afterwards. Leaves status, dir (the case's folder:
# home/, xdg/, tmp/, log, out, err), cache (where the catalogue is to be cached), gaia and apt
# (where the Gaia catalogue and the private apt configuration go).
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
    gaia="${cache%/kstars}/gaia"
    apt="${cache%/kstars}/apt"
    env -i PATH="$path" HOME="$dir/home" TMPDIR="$dir/tmp" "${xdg_env[@]}" \
        ND_SYSTEM_CATALOGUE="$dir/system/stars.dat" \
        ND_FAKE_LOG="$dir/log" ND_FAKE_STATE="$dir/state" ND_FAKE_UID="$uid" \
        ND_FAKE_MISSING="$missing" ND_FAKE_LISTS="$lists" \
        ND_APT_ETC="$work/apt/${apt_sources:-none}" ND_FAKE_PACKAGES="$work/packages" \
        ND_FAKE_SUITES="${suites:-}" ND_FAKE_ARCHIVE="${archive:-reachable}" \
        "$work/tools/bash" "$setup" > "$dir/out" 2> "$dir/err"
    status=$?
    apt_sources="" suites="" archive=""
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

# One apt-get call with the private configuration under $apt, as root (root) or not (user).
private_apt_call()
{
    local sandbox=""
    [ "$1" = root ] && sandbox=" -o APT::Sandbox::User=root"
    echo "apt-get [noninteractive] -o Dir::Etc::SourceList=$apt/sources.list" \
        "-o Dir::Etc::SourceParts=$apt/sources.list.d -o Dir::State::Lists=$apt/lists" \
        "-o Dir::Cache=$apt/cache -o Dir::State::status=/dev/null$sandbox -q $2"
}

# The Gaia cache holds exactly what the set-up keeps of package KIND, with VERSION in "package"
# and every file's md5 in "complete"; nothing else of the fetch is left behind.
expect_gaia_cache()
{
    local kind=$1 version=$2 name file
    local got
    got=$(cd "$gaia" 2> /dev/null && echo *)
    [ "$got" = "$gaia_files" ] || fail "the Gaia cache holds \"$got\", expected \"$gaia_files\""
    for name in $gaia_files; do
        case "$name" in
            package | complete) continue ;;
            common_star_names.fab) file="$work/packages/$kind/data/usr/share/stellarium/skycultures/$name" ;;
            *) file="$work/packages/$kind/data/usr/share/stellarium/stars/hip_gaia3/$name" ;;
        esac
        cmp -s "$file" "$gaia/$name" || fail "$gaia/$name differs from the package's $name"
        grep -qx "$(md5sum < "$file" | cut -d' ' -f1)  $name" "$gaia/complete" \
            || fail "complete does not list $name with its md5"
    done
    expect_file "$gaia/package" "stellarium-data $version"
    expect_no_file "$apt"
    expect_no_file "$gaia.new"
    expect_in out "setup: Gaia star catalogue: $gaia (stellarium-data $version)"
}

# A good Gaia cache from an earlier case, copied into this case's folder before it runs.
seed_gaia_cache()
{
    mkdir -p "$work/$case_name/home/.cache/nightdome"
    cp -r "$work/gaia-fetched-as-root/home/.cache/nightdome/gaia" "$work/$case_name/home/.cache/nightdome/"
    seeded="$work/$case_name/home/.cache/nightdome/gaia"
}

# The one line saying the sky falls back to kstars-data, and that no Gaia cache was made.
expect_fallback()
{
    local why=$1
    local lines
    lines=$(grep -c "the sky will be the Hipparcos catalogue of kstars-data" "$dir/out")
    [ "$lines" = 1 ] || fail "the fallback is said on $lines lines: $(cat "$dir/out")"
    expect_in out "setup: $why; the sky will be the Hipparcos catalogue of kstars-data"
    expect_no_file "$gaia/complete"
    expect_no_file "$apt"
    expect_no_file "$gaia.new"
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

# The Gaia catalogue as root: the archive is the system's Debian main archive (not the foreign
# or security ones, nor a disabled entry) with its keyring, in the testing suite, reached only
# through the private configuration; the kept files land flat in the cache.
apt_sources_before=$(find "$work/apt" -type f -exec md5sum {} + | sort)
case_name="gaia-fetched-as-root"
uid=0 sudo=yes missing="" lists=fresh system_catalogue=yes xdg=no
apt_sources=deb822 suites="testing=gaia:26.3-1"
run_setup
expect_status 0
expect_calls "apt-get" "$(private_apt_call root update)" "$(private_apt_call root "download stellarium-data")"
expect_calls "sources" \
    "sources: deb [signed-by=/usr/share/keyrings/debian-archive-keyring.gpg] http://mirror.example/debian testing main"
expect_calls "sudo"
expect_gaia_cache gaia 26.3-1
expect_in out "setup: fetching the Gaia star catalogue from stellarium-data of http://mirror.example/debian"

# Not root and no sudo: the Gaia catalogue needs neither (apt keeps its own user then); the
# one-line sources give the archive, and the cache follows XDG_CACHE_HOME.
case_name="gaia-fetched-without-root"
uid=1000 sudo=no missing="" lists=fresh system_catalogue=yes xdg=yes
apt_sources=list suites="testing=gaia:26.3-1"
run_setup
expect_status 0
expect_calls "apt-get" "$(private_apt_call user update)" "$(private_apt_call user "download stellarium-data")"
expect_calls "sources" \
    "sources: deb [signed-by=/etc/apt/keyrings/debian.gpg] http://ftp.example.org/debian/ testing main"
expect_gaia_cache gaia 26.3-1
expect_no_file "$dir/home/.cache"

# A good cache: checked, and nothing fetched.
case_name="gaia-already-cached"
uid=1000 sudo=no missing="" lists=fresh system_catalogue=yes xdg=no
seed_gaia_cache
apt_sources=deb822 suites="testing=gaia:26.3-1"
run_setup
expect_status 0
expect_calls "apt-get"
expect_calls "dpkg-deb"
expect_gaia_cache gaia 26.3-1
[ "$(grep -c "^setup: " "$dir/out")" = 3 ] || fail "more than three lines: $(cat "$dir/out")"

# One file changed in place (same size): noticed, said in one line, and fetched again.
case_name="gaia-cache-damaged"
uid=1000 sudo=no missing="" lists=fresh system_catalogue=yes xdg=no
seed_gaia_cache
echo "the fainter starz" > "$seeded/stars_1_0v0_16.cat"
apt_sources=deb822 suites="testing=gaia:26.3-1"
run_setup
expect_status 0
expect_in out "setup: the Gaia catalogue in $gaia is damaged (stars_1_0v0_16.cat does not match its checksum); fetching it again"
expect_calls "apt-get" "$(private_apt_call user update)" "$(private_apt_call user "download stellarium-data")"
expect_gaia_cache gaia 26.3-1

# A file missing: the same.
case_name="gaia-cache-missing-a-file"
uid=1000 sudo=no missing="" lists=fresh system_catalogue=yes xdg=no
seed_gaia_cache
rm "$seeded/stars_0_0v0_21.cat"
apt_sources=deb822 suites="testing=gaia:26.3-1"
run_setup
expect_status 0
expect_in out "setup: the Gaia catalogue in $gaia is damaged (stars_0_0v0_21.cat is missing); fetching it again"
expect_gaia_cache gaia 26.3-1

# A fetch that stopped half-way (no "complete"): fetched again.
case_name="gaia-cache-partial"
uid=0 sudo=no missing="" lists=fresh system_catalogue=yes xdg=no
seed_gaia_cache
rm "$seeded/complete" "$seeded/stars_hip_sp_0v0_6.cat"
apt_sources=deb822 suites="testing=gaia:26.3-1"
run_setup
expect_status 0
expect_in out "setup: the Gaia catalogue in $gaia is partial (no \"complete\"); fetching it again"
expect_calls "apt-get" "$(private_apt_call root update)" "$(private_apt_call root "download stellarium-data")"
expect_gaia_cache gaia 26.3-1

# Testing still carries the older catalogue: unstable is tried next.
case_name="gaia-only-in-unstable"
uid=1000 sudo=no missing="" lists=fresh system_catalogue=yes xdg=no
apt_sources=deb822 suites="testing=old:0.22.2-1 unstable=gaia:26.4-1"
run_setup
expect_status 0
expect_calls "sources" \
    "sources: deb [signed-by=/usr/share/keyrings/debian-archive-keyring.gpg] http://mirror.example/debian testing main" \
    "sources: deb [signed-by=/usr/share/keyrings/debian-archive-keyring.gpg] http://mirror.example/debian unstable main"
expect_gaia_cache gaia 26.4-1

# Testing's package has no Gaia catalogue and unstable none at all: one line naming the
# package that was there, status 0, no cache.
case_name="no-gaia-catalogue-in-the-archive"
uid=0 sudo=no missing="" lists=fresh system_catalogue=yes xdg=no
apt_sources=deb822 suites="testing=old:0.22.2-1"
run_setup
expect_status 0
expect_fallback "no Gaia star catalogue in the archive (stellarium-data 0.22.2-1 has none)"

# No stellarium-data at all.
case_name="no-stellarium-data-in-the-archive"
uid=1000 sudo=no missing="" lists=fresh system_catalogue=yes xdg=no
apt_sources=list suites=""
run_setup
expect_status 0
expect_fallback "no stellarium-data in unstable of http://ftp.example.org/debian/"

# A package whose star file is not the one its configuration names: not kept.
case_name="gaia-star-file-against-its-configuration"
uid=1000 sudo=no missing="" lists=fresh system_catalogue=yes xdg=no
apt_sources=deb822 suites="testing=mismatch:26.3-1 unstable=mismatch:26.3-1"
run_setup
expect_status 0
expect_fallback "stellarium-data 26.3-1: stars_1_0v0_16.cat does not match defaultStarsConfig.json"

# The archive cannot be reached and the cache was damaged: one line, and the damaged cache is
# no longer marked complete, so the build does not read it.
case_name="archive-unreachable"
uid=1000 sudo=no missing="" lists=fresh system_catalogue=yes xdg=no
seed_gaia_cache
echo "the fainter starz" > "$seeded/stars_1_0v0_16.cat"
apt_sources=deb822 suites="testing=gaia:26.3-1" archive=unreachable
run_setup
expect_status 0
expect_calls "apt-get" "$(private_apt_call user update)"
expect_fallback "cannot read testing of http://mirror.example/debian: E: Failed to fetch $apt/sources.list: could not resolve the host"

# No Debian archive among the sources.
case_name="no-debian-archive-in-the-sources"
uid=1000 sudo=no missing="" lists=fresh system_catalogue=yes xdg=no
apt_sources=none
run_setup
expect_status 0
expect_calls "apt-get"
expect_fallback "no Debian archive in the apt sources to fetch the Gaia catalogue from"

case_name="system-apt-sources-untouched"
[ "$(find "$work/apt" -type f -exec md5sum {} + | sort)" = "$apt_sources_before" ] \
    || fail "the apt sources the set-up read were changed"

finish setup-test
