# Sourced by the cases about the Debian packages: where they are.
# shellcheck shell=sh
: "${work:?}" "${KORVA_BINARY_DIR:?}" "${KORVA_WORD_SIZE:?}"
packages=$KORVA_BINARY_DIR/packages
# For those that source this.
# shellcheck disable=SC2034
if [ "$KORVA_WORD_SIZE" = 64 ]; then
    architecture=amd64 triplet=x86_64-linux-gnu other=i386 other_triplet=i386-linux-gnu
else
    architecture=i386 triplet=i386-linux-gnu other=amd64 other_triplet=x86_64-linux-gnu
fi

# What is packed: the endpoint is there in 64 bit only.
components="provider companion dev tools"
[ "$KORVA_WORD_SIZE" = 32 ] || components="$components server"

package() { echo "$packages/korva-osstatus-$1_1.0.0-1_$architecture.deb"; }
