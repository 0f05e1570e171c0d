# shellcheck shell=bash
# Building for ./run and ./test, and ending every process that they started. Sourced by both.

work=$(mktemp -d /tmp/kestrum.XXXXXX) || { echo "${0##*/}: /tmp cannot be written: is the disk full?" >&2; exit 1; }
group=""

# Ends a group of processes, and returns after all of them have ended.
end_group() {
    kill -TERM -- "-$1" "$1" 2>/dev/null || true
    for _ in {1..100}; do
        kill -0 -- "-$1" 2>/dev/null || return 0
        sleep 0.05
    done
    kill -KILL -- "-$1" 2>/dev/null || true
}

finish() {
    trap '' HUP INT TERM
    [ -z "$group" ] || end_group "$group"
    rm -rf "$work"
}
trap finish EXIT
trap 'exit 129' HUP
trap 'exit 130' INT
trap 'exit 143' TERM

# Runs a command in a separate process group, which finish() can end as a whole. In the background, so that the shell
# handles signals at once.
guarded() {
    local status=0
    env --default-signal=INT,QUIT setsid "$@" </dev/null &
    group=$!
    wait "$group" || status=$?
    group=""
    return "$status"
}

# Whether version $2 is $1 or later.
at_least() { [ "$(printf '%s\n' "$1" "$2" | sort -V | head -n 1)" = "$1" ]; }

require_tools() {
    local compiler=${CXX:-c++} least=12 found
    for tool in cmake ninja "$compiler"; do
        command -v "$tool" >/dev/null || fail "$tool is missing: please install it, then start again"
    done
    found=$(cmake --version | grep -oE '[0-9]+(\.[0-9]+)+' | head -n 1)
    at_least 3.25 "$found" || fail "CMake $found is too old: please install 3.25 or later, then start again"
    ! "$compiler" --version | grep -q clang || least=16
    found=$("$compiler" -dumpversion)
    at_least $least "$found" ||
        fail "$compiler $found is too old: please install g++ 12 or Clang 16 or later, and name it in CXX"
}

explain_build() {
    [ ! -s "$work/log" ] || cat "$work/log" >&2
    if [ "$(df --output=avail -k build | tail -n 1)" -lt 20000 ]; then
        fail "the disk is full: make room for 500 MB, then start again"
    fi
    fail "the build failed, see above"
}

# Builds a preset. Shows the build tool's progress on a terminal; elsewhere only the log of a failure.
build() {
    local preset=$1
    require_tools
    echo "Building (the first time takes some minutes) ..." >&2
    mkdir -p build 2>/dev/null || fail "$PWD/build cannot be written"
    # Files that another place or compiler left in the folder must not make the build fail.
    guarded cmake --preset "$preset" >"$work/log" 2>&1 || guarded cmake --fresh --preset "$preset" >"$work/log" 2>&1 ||
        explain_build
    : >"$work/log"
    if on_terminal; then
        guarded ninja -C "build/$preset" >&2
    else
        guarded ninja -C "build/$preset" >"$work/log" 2>&1
    fi || explain_build
}
