# shellcheck shell=bash
# The part every case-by-case shell check shares (sourced): a temporary folder for the run
# ($work, removed at exit), failures counted by case (case_name), and the closing verdict.

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
failures=0
case_name=""

fail()
{
    echo "FAIL [$case_name]: $*" >&2
    failures=$((failures + 1))
}

# Says how the run went, named NAME, and exits with its status.
finish()
{
    if [ "$failures" -ne 0 ]; then
        echo "$1: $failures failed checks" >&2
        exit 1
    fi
    echo "$1: all cases passed"
    exit 0
}
