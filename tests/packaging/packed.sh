# Sourced by the cases about the Debian packages: where they are.
# shellcheck shell=sh
: "${work:?}" "${KORVA_BINARY_DIR:?}" "${KORVA_WORD_SIZE:?}"
packages=$KORVA_BINARY_DIR/packages
architecture=amd64
# For those that source this.
# shellcheck disable=SC2034
triplet=x86_64-linux-gnu
if [ "$KORVA_WORD_SIZE" = 32 ]; then
    architecture=i386
    # shellcheck disable=SC2034
    triplet=i386-linux-gnu
fi

package() { echo "$packages/korva-osstatus-$1_1.0.0-1_$architecture.deb"; }
