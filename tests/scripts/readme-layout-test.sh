#!/usr/bin/env bash
# The README's layout table against the tree: every folder it names exists, every top-level
# folder of the repository has a line, and no line promises what is "later" or "to come"
# instead of saying what the folder holds now.
#
# Usage: readme-layout-test.sh [repository-root [readme]]
set -uo pipefail

root=${1:-$(cd "$(dirname "$0")/../.." && pwd)}
readme=${2:-$root/README.md}
failures=0

fail()
{
    echo "FAIL: $*" >&2
    failures=$((failures + 1))
}

# The table's rows: the lines of the "## Layout" section that start with "| `".
rows=$(sed -n '/^## Layout/,/^## /p' "$readme" | grep '^| `')
[ -n "$rows" ] || {
    echo "FAIL: no layout table in $readme" >&2
    exit 1
}

# Folder names from each row's first cell: `name/`, several to a cell at most.
# shellcheck disable=SC2016 # the backquotes are the text searched for
named=$(printf '%s\n' "$rows" | cut -d'|' -f2 | grep -o '`[^`]*/`' | tr -d '`' | sed 's:/$::' | sort)

for folder in $named; do
    [ -d "$root/$folder" ] || fail "the table names $folder/, which does not exist"
done

# Top-level folders, less hidden ones and what git ignores (build trees).
for path in "$root"/*/; do
    folder=$(basename "$path")
    if git -C "$root" rev-parse --is-inside-work-tree > /dev/null 2>&1; then
        git -C "$root" check-ignore -q "$folder/" && continue
    else
        case "$folder" in build | build-*) continue ;; esac
    fi
    # A here-string, not a pipe: grep -q stops reading at its match, and the writer of a pipe
    # could then die of SIGPIPE, which pipefail would count as no match.
    grep -qx "$folder" <<< "$named" || fail "the table has no line for $folder/"
done

while IFS= read -r row; do
    if grep -qiE '\blater\b|to come' <<< "$row"; then
        fail "a line says what is to come, not what is there: $row"
    fi
done <<< "$rows"

if [ "$failures" -ne 0 ]; then
    echo "readme-layout-test: $failures failed checks" >&2
    exit 1
fi
echo "readme-layout-test: $(printf '%s\n' "$named" | wc -l) folders, all present and described"
