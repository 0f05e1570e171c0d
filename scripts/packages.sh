# shellcheck shell=bash
# The Debian packages that the project needs, and their installation. Sourced by ./run, ./test and .ci/run.

# shellcheck disable=SC2034  # used by the scripts that source this one
readonly run_packages=(
    g++ cmake ninja-build
    qt6-base-dev libqt6svg6 fonts-liberation2
    libncurses-dev libexpat1-dev
    libcli11-dev nlohmann-json3-dev
)
# shellcheck disable=SC2034
readonly test_packages=(
    libgtest-dev libgmock-dev librapidcheck-dev
    python3 dbus libvterm-dev xvfb at-spi2-core gpsd modemmanager python3-dbusmock dbus-bin
)
# For scripts/bench.
# shellcheck disable=SC2034
readonly bench_packages=(libbenchmark-dev valgrind xvfb python3 git)
# For making and checking the package.
# shellcheck disable=SC2034
readonly package_packages=(dpkg-dev file lintian desktop-file-utils appstream mandoc systemd)
# shellcheck disable=SC2034
readonly ci_packages=(clang-16 clang-format-16 clang-tidy-16 libclang-rt-16-dev git debootstrap valgrind)

fail() { echo "${0##*/}: $*" >&2; exit 1; }

# Whether standard error can show a line that is rewritten.
on_terminal() { [ -t 2 ] && [ "${TERM:-dumb}" != dumb ]; }

missing_packages() {
    # shellcheck disable=SC2016  # dpkg-query expands the variables
    dpkg-query -W -f '${db:Status-Abbrev} ${Package}\n' "$@" 2>/dev/null | sed -n 's/^ii  *//p' |
        sort -u | comm -13 - <(printf '%s\n' "$@" | sort -u)
}

# Writes apt's output to the given log, and its progress to a line that is rewritten. It reads to the end and ignores
# signals: apt finishes unpacking then, but would fail half-way if its output were closed.
follow_apt() {
    trap '' HUP INT TERM
    local line percent what
    while IFS= read -r line; do
        case $line in
            dlstatus:*|pmstatus:*)
                IFS=: read -r _ _ percent what <<<"$line"
                ! on_terminal || printf '\r\e[K%3.0f %%  %.65s' "${percent%.*}" "$what" >&2
                ;;
            *) echo "$line" >>"$1" ;;
        esac
    done
    ! on_terminal || printf '\r\e[K' >&2
}

# One line with the reason and the remedy.
explain_apt() {
    local log=$1
    shift
    grep -h '^E: ' "$log" | sort -u | tail -n 3 >&2 || true
    if grep -qE 'No space left|enough free space' "$log"; then
        fail "the disk is full: make room for 2 GB of packages and their build, then start again"
    elif grep -qE 'Unable to locate|no installation candidate' "$log" && ! grep -q 'Failed to fetch' "$log"; then
        fail "this system's package source lacks what Kestrum needs; it is set up for Debian 12 and 13"
    elif grep -qE 'Failed to fetch|Unable to locate' "$log"; then
        fail "the package source cannot be reached: check the network, then start again"
    fi
    fail "the packages could not be installed: correct the errors of apt above, then start again (its output: $log)"
}

# Installs the given packages that are missing. When none is missing, it needs neither network nor root.
ensure_packages() {
    [ -z "${KESTRUM_SKIP_INSTALL:-}" ] || return 0
    if ! command -v apt-get >/dev/null; then
        printf '  %s\n' "$@" >&2
        fail "Kestrum is set up for Debian 12 and 13. Here, please install the software of the packages above, then start" \
             "again with KESTRUM_SKIP_INSTALL=1"
    fi
    local missing as_root=() log
    mapfile -t missing < <(missing_packages "$@")
    [ ${#missing[@]} -gt 0 ] || return 0
    if [ "$(id -u)" -ne 0 ]; then
        as_root=(sudo)
        if ! command -v sudo >/dev/null || ! sudo true; then
            echo "  apt-get install --no-install-recommends ${missing[*]}" >&2
            fail "packages are missing, and installing them needs root: run the line above as root, then start again"
        fi
    fi
    echo "Installing ${#missing[@]} packages and what they need: ${missing[*]}" >&2
    log=$(mktemp) || fail "no temporary file can be written: is the disk full?"
    as_root+=(env LC_ALL=C DEBIAN_FRONTEND=noninteractive)
    # The first command repairs an installation that was interrupted. A source that fails to update may be one that no
    # needed package comes from.
    {
        "${as_root[@]}" dpkg --configure -a || true
        "${as_root[@]}" apt-get update -q -o APT::Status-Fd=1 || true
        "${as_root[@]}" apt-get install -q -y --fix-broken --no-install-recommends -o APT::Status-Fd=1 \
            -o DPkg::Lock::Timeout=300 "${missing[@]}"
    } 2>&1 </dev/null | follow_apt "$log" || explain_apt "$log"
    rm -f "$log"
}
