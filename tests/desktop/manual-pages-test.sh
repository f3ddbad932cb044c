#!/usr/bin/env bash
# The manual pages format without a single warning from groff. Usage: <groff> <page>...
set -uo pipefail
groff=$1
shift
status=0
for page in "$@"; do
    if [ ! -s "$page" ]; then
        echo "missing manual page: $page" >&2
        status=1
        continue
    fi
    warnings=$("$groff" -man -ww -z "$page" 2>&1)
    if [ -n "$warnings" ]; then
        echo "$page: groff warns:" >&2
        echo "$warnings" >&2
        status=1
    fi
    # Every page names itself and says what it does.
    grep -q '^\.SH NAME' "$page" || { echo "$page: no NAME section" >&2; status=1; }
    grep -q '^\.SH SYNOPSIS' "$page" || { echo "$page: no SYNOPSIS section" >&2; status=1; }
done
exit $status
