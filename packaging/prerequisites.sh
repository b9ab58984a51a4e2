# Sourced by run and check: installs the Debian packages that they name.
# shellcheck shell=sh

# Prints those of the named packages that are not installed.
missing_packages() {
    for package in "$@"; do
        state=$(dpkg-query -W -f '${db:Status-Status}' "$package" 2>/dev/null) || state=none
        [ "$state" = installed ] || printf '%s ' "$package"
    done
}

# Without apt-get: says what the named packages are for Debian's, and whether it is worth going on.
need_elsewhere() {
    echo "== No apt-get here. What is needed has these names in Debian: $*"
    for command in cmake ninja g++; do
        command -v "$command" >/dev/null || {
            echo "$command is missing: install it and the others, then run this again" >&2
            return 1
        }
    done
}

# Installs the named packages, as root or through sudo. Does nothing when they are all there.
need() {
    if ! command -v apt-get >/dev/null || ! command -v dpkg-query >/dev/null; then
        need_elsewhere "$@"
        return
    fi
    missing=$(missing_packages "$@")
    [ -n "$missing" ] || return 0
    echo "== Installing packages: $missing"
    as_root=
    if [ "$(id -u)" -ne 0 ]; then
        command -v sudo >/dev/null || {
            echo "Run this as root, or install sudo, or install these packages: $missing" >&2
            return 1
        }
        as_root=sudo
    fi
    $as_root env DEBIAN_FRONTEND=noninteractive apt-get -qq update
    # The package names are meant to be split.
    # shellcheck disable=SC2086
    $as_root env DEBIAN_FRONTEND=noninteractive apt-get -qq -y install --no-install-recommends \
        -o Dpkg::Use-Pty=0 $missing >/dev/null
}

# What the benchmarks need beyond that.
# shellcheck disable=SC2034
bench_packages="libbenchmark-dev valgrind"

# What looks at the source.
# shellcheck disable=SC2034
lint_packages="clang-format clang-tidy shellcheck git"

# What 64-bit builds need beside that, for the endpoint and its tests.
# shellcheck disable=SC2034
server_packages="libmicrohttpd-dev libexpat1-dev libcrypt-dev libgnutls28-dev python3"

# What asks the endpoint in tests and documents.
# shellcheck disable=SC2034
client_packages="sblim-wbemcli openssl curl"

# What every build needs; g++-multilib compiles 32-bit code on a 64-bit machine.
build_packages="cmake ninja-build g++ libc6-dev googletest libcli11-dev nlohmann-json3-dev \
    libvalijson-dev"
[ "$(dpkg --print-architecture 2>/dev/null)" = i386 ] || build_packages="$build_packages g++-multilib"

# What packs; binutils of i386 are for its packages on another machine.
# shellcheck disable=SC2034
package_packages="debhelper dpkg-dev xz-utils binutils-i686-linux-gnu rpm debugedit elfutils cpio file pkg-config systemd"
