# Sourced by the scripts in here, which try-packages calls in a mount namespace of their own:
#   SCRIPT ARCHITECTURE SUITE MIRROR PACKAGES WORK
# PACKAGES is the folder of the packages, WORK an empty folder that a system is made in.
# shellcheck shell=sh
set -eu
architecture=$1
suite=$2
mirror=$3
# For those that source this.
# shellcheck disable=SC2034
packages=$4
work=$5
root=$work/root
log=$work/log
status=0

# check WHAT COMMAND...: runs it, tells whether it did well, and goes on.
check() {
    what=$1
    shift
    # In a condition, a function would go on behind a command that fails.
    set +e
    (set -e; "$@") >"$log" 2>&1
    code=$?
    set -e
    if [ "$code" -eq 0 ]; then
        echo "ok      $what"
    else
        echo "FAILED  $what"
        tail -n 40 "$log" | sed 's/^/        /'
        status=1
    fi
}

# Runs a command in the system.
inside() {
    env -i PATH=/usr/sbin:/usr/bin:/sbin:/bin LC_ALL=C DEBIAN_FRONTEND=noninteractive \
        ${http_proxy:+"http_proxy=$http_proxy"} ${https_proxy:+"https_proxy=$https_proxy"} chroot "$root" "$@"
}

make_system() {
    debootstrap --variant=minbase --arch="$architecture" "$suite" "$root" "$mirror"
    mount -t proc proc "$root/proc"
    inside apt-get -qq clean
}

# make_later PACKAGE FOLDER: the same as a later version, which goes with the later ones of its kind.
make_later() {
    version=$(dpkg-deb -f "$1" Version)
    dpkg-deb -R "$1" "$work/unpacked"
    sed -i "s/^Version: .*/&+later/; s/(= $version)/(= $version+later)/g" "$work/unpacked/DEBIAN/control"
    dpkg-deb --root-owner-group -b "$work/unpacked" "$2"
    rm -r "$work/unpacked"
}

# shows PATTERN COMMAND...: the command, run in the system, prints a line like that.
shows() {
    pattern=$1
    shift
    inside "$@" >"$work/shown"
    grep -Eq -e "$pattern" "$work/shown" || {
        echo "no line like '$pattern':"
        cat "$work/shown"
        return 1
    }
}

check "a fresh system" make_system
[ "$status" -eq 0 ] || exit 1
