# Tries the packages of amd64 and i386 in one system, of amd64.
# shellcheck shell=sh
# Functions are run by check, and dpkg-query fills in what stands in its format.
# shellcheck disable=SC2317,SC2016
# shellcheck source=system.sh
. "$(dirname "$0")/system.sh"
: "${packages:?}" "${work:?}" "${root:?}" "${status:?}"
facade=libkorvaosstatusfacade.so

bring_packages() {
    inside dpkg --add-architecture i386
    inside apt-get -qq update
    mkdir "$root/amd64" "$root/i386" "$root/later" "$root/opt/i386"
    for name in provider companion; do cp "$packages/korva-osstatus-${name}"_*_i386.deb "$root/i386/"; done
    for name in provider companion tools; do cp "$packages/korva-osstatus-${name}"_*_amd64.deb "$root/amd64/"; done
    for package in "$root"/amd64/*.deb "$root"/i386/*.deb; do make_later "$package" "$root/later/"; done
    # One system has one cmpihost; that of i386 is there to ask the libraries of its word size. It looks for
    # the schema beside itself.
    dpkg-deb -x "$packages/korva-osstatus-tools"_*_i386.deb "$root/opt/i386"
    ln -s /usr/share/korva-osstatus "$root/opt/i386/usr/share/"
}
install_from() { inside sh -c "apt-get -y install /$1/*.deb"; }
leads_to() { [ "$(inside readlink -f "/usr/lib/cmpi/$facade")" = "/usr/lib/$1/cmpi/$facade.1.0.0" ]; }
has_both() {
    [ "$(inside dpkg-query -W -f '${db:Status-Abbrev}${binary:Package}\n' 'korva-osstatus-[pc]*')" = \
        "ii korva-osstatus-companion:amd64
ii korva-osstatus-companion:i386
ii korva-osstatus-provider:amd64
ii korva-osstatus-provider:i386" ]
}
asks_amd64() { shows 'Name="Debian GNU/Linux"' cmpihost ein KORVA_OperatingSystem; }
# asks_i386 FOLDER: what a 32-bit object manager with that folder would.
asks_i386() {
    shows 'Name="Debian GNU/Linux"' /opt/i386/usr/bin/cmpihost --provider "$1/$facade" ein KORVA_OperatingSystem
}

check "the packages of both" bring_packages
check "apt-get install of amd64" install_from amd64
check "apt-get install of i386" install_from i386
check "both are installed" has_both
check "the folder of object managers keeps leading to amd64" leads_to x86_64-linux-gnu
check "amd64 answers" asks_amd64
check "i386 answers, from its own folder" asks_i386 /usr/lib/i386-linux-gnu/cmpi
check "the folder is switched" \
    inside update-alternatives --set korva-osstatus "/usr/lib/i386-linux-gnu/cmpi/$facade"
check "i386 answers, from the folder of object managers" asks_i386 /usr/lib/cmpi
check "amd64 answers all the same" asks_amd64
check "apt-get install of later versions of both" install_from later
check "the folder still leads to i386" leads_to i386-linux-gnu
check "i386 answers, from the folder of object managers" asks_i386 /usr/lib/cmpi
check "the folder is switched back" \
    inside update-alternatives --set korva-osstatus "/usr/lib/x86_64-linux-gnu/cmpi/$facade"
check "apt-get remove of amd64" inside apt-get -y remove korva-osstatus-provider:amd64
check "the folder leads to i386" leads_to i386-linux-gnu
check "i386 answers, from the folder of object managers" asks_i386 /usr/lib/cmpi
check "apt-get purge of i386" inside apt-get -y purge korva-osstatus-provider:i386
check "the folder is gone" [ ! -e "$root/usr/lib/cmpi" ]
exit "$status"
