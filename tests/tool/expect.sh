# Shared by the tests of the program: a scratch folder, and checks that count what fails.

set -u
program=$(realpath "$1")
media=$(realpath "$2")
pictures=$(realpath "$3")
# For builds with sanitizers.
export LSAN_OPTIONS="suppressions=$(realpath "$(dirname "$0")")/leaks.supp:print_suppressions=0"
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
chmod 755 "$scratch"
cd "$scratch" || exit 1
failures=0
checks=0

fail() {
    echo "FAILED: $*"
    failures=$((failures + 1))
}

# expect CODE TEXT ARGUMENT...: the program ends with CODE, and TEXT stands in what it says.
expect() {
    local code=$1 text=$2 said got
    shift 2
    checks=$((checks + 1))
    said=$("$program" "$@" 2>&1)
    got=$?
    [ "$got" -eq "$code" ] || fail "pixelkiln $*: exit $got, not $code: $said"
    case $said in
    *"$text"*) ;;
    *) fail "pixelkiln $*: does not say '$text' but: $said" ;;
    esac
}

# is WHAT GOT WANTED
is() {
    checks=$((checks + 1))
    [ "$2" = "$3" ] || fail "$1: '$2', not '$3'"
}

# same WHAT FILE FILE: byte by byte
same() {
    is "$1" "$(cmp "$2" "$3" && echo equal)" equal
}

# identical FILE FILE: as pictures
identical() {
    expect 0 "identical" compare "$1" "$2" --limit 0
}

# The bytes of standard input in hexadecimal, on one line.
hex() {
    od -An -v -tx1 | tr -d '\n' | sed 's/^ //'
}

# Names in a folder, hidden ones too.
names() {
    ls -A "$1" | tr '\n' ' '
}

finish() {
    echo "$checks checks, $failures failed"
    [ "$checks" -gt 0 ] && [ "$failures" -eq 0 ]
    exit $?
}
