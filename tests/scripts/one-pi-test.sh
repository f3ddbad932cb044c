#!/usr/bin/env bash
# Pi has one source, kPI in core/Constants.h: no other program, tool or benchmark source keeps
# a copy of its own (a literal, a full or half turn written out, M_PI, std::numbers::pi or
# acos(-1)). Tests may write the number out to check against.
#
# Usage: one-pi-test.sh [repository-root]
set -uo pipefail

root=${1:-$(cd "$(dirname "$0")/../.." && pwd)}
cd "$root" || exit 1

if git rev-parse --is-inside-work-tree > /dev/null 2>&1; then
    files=$(git ls-files --cached --others --exclude-standard -- '*.cpp' '*.h' '*.cc' '*.hpp')
else
    files=$(find . -path ./build -prune -o -path './build-*' -prune -o -path ./.git -prune -o \
        -type f \( -name '*.cpp' -o -name '*.h' -o -name '*.cc' -o -name '*.hpp' \) -print \
        | sed 's:^\./::')
fi
files=$(printf '%s\n' "$files" | grep -v -e '^tests/' -e '^core/Constants\.h$' | sort -u)
[ -n "$files" ] || {
    echo "FAIL: no sources found under $root" >&2
    exit 1
}

pattern='3\.14159|6\.28318|1\.57079|\bM_PI|numbers::pi|\bpi_v\b|acos\(-1'
copies=$(printf '%s\n' "$files" | while IFS= read -r f; do
    [ -f "$f" ] && grep -nHE "$pattern" -- "$f"
done)
if [ -n "$copies" ]; then
    echo "FAIL: private copies of pi; use kPI from core/Constants.h:" >&2
    printf '%s\n' "$copies" >&2
    exit 1
fi
echo "one-pi-test: $(printf '%s\n' "$files" | wc -l) sources, pi only from core/Constants.h"
