# What the project needs of the system, and how it gets there. Sourced by ./run, ./test and .ci/run.

readonly run_packages=(
    g++ cmake ninja-build pkg-config
    qt6-base-dev libqt6svg6 fonts-liberation2
    libncurses-dev libexpat1-dev
    libcli11-dev nlohmann-json3-dev
)
readonly test_packages=(
    libgtest-dev libgmock-dev librapidcheck-dev libbenchmark-dev
    python3 dbus libvterm-dev
)
# To make the package, and to look it over.
readonly package_packages=(dpkg-dev file lintian desktop-file-utils appstream mandoc systemd)
readonly ci_packages=(clang-16 clang-format-16 clang-tidy-16 libclang-rt-16-dev git)

# Installs those of the given packages that are missing.
install_packages() {
    if ! command -v apt-get >/dev/null; then
        echo "Kestrum is set up for Debian 12. Here, please install what these packages hold, then start again" \
             "with KESTRUM_SKIP_INSTALL=1:" >&2
        printf '  %s\n' "$@" >&2
        exit 1
    fi
    local missing=()
    for package in "$@"; do
        dpkg-query -W -f '${Status}' "$package" 2>/dev/null | grep -q 'install ok installed' || missing+=("$package")
    done
    [ ${#missing[@]} -eq 0 ] && return
    echo "Installing ${#missing[@]} packages: ${missing[*]}" >&2
    local as_root=()
    if [ "$(id -u)" -ne 0 ]; then
        if ! command -v sudo >/dev/null; then
            echo "These packages are missing, and there is no sudo to install them with:" >&2
            echo "  apt-get install ${missing[*]}" >&2
            exit 1
        fi
        as_root=(sudo)
    fi
    "${as_root[@]}" apt-get update -qq
    "${as_root[@]}" env DEBIAN_FRONTEND=noninteractive apt-get install -qq -y --no-install-recommends "${missing[@]}" \
        >/dev/null
}

ensure_packages() {
    [ -n "${KESTRUM_SKIP_INSTALL:-}" ] || install_packages "$@"
}
