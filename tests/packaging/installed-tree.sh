# What `cmake --install` puts into a folder, and whether it works from there.
# shellcheck shell=sh
: "${work:?}" "${KORVA_BINARY_DIR:?}" "${KORVA_SOURCE_DIR:?}" "${KORVA_WORD_SIZE:?}"
destination=$work/destination
tree=$destination/usr

# install_tree [OPTION...]
install_tree() { DESTDIR=$destination expect_success cmake --install "$KORVA_BINARY_DIR" --prefix /usr "$@"; }

# Files and links below a folder, and where the links lead to.
listing() { (cd "$1" && find . ! -type d \( -type l -printf '%P -> %l\n' -o -printf '%P\n' \) | LC_ALL=C sort); }

# Without any help from the environment.
host() { env -i "$tree/bin/cmpihost" "$@"; }

# The endpoint is there in 64 bit only.
expected_files() {
    if [ "$KORVA_WORD_SIZE" = 64 ]; then cat installed-files.txt; else grep -Ev 'cmpihost-serve|/systemd/' installed-files.txt; fi
}

AllFilesAreAtTheirPlaces() {
    install_tree
    # The documents grow.
    rm -r "$tree/share/doc"
    expect_equal "the tree" "$(expected_files)" "$(listing "$destination")"
}

DocumentsForUsersAreThereAndLinkToEachOtherOnly() {
    install_tree --component provider
    cd "$tree/share/doc/korva-osstatus" || fail "no documents"
    expect_equal "the folder" "$(printf '%s\n' CHANGELOG.md LICENSE README.md SECURITY.md docs)" "$(ls)"
    expect_equal "the documents" "$(cd "$KORVA_SOURCE_DIR/docs" && ls ./*.md ./*.json)" "$(cd docs && ls ./*)"
    expect_success sh "$KORVA_SOURCE_DIR/tests/links.sh" ./*.md docs/*.md
}

HostReportsTheOperatingSystem() {
    install_tree
    host --format json ei KORVA_OperatingSystem >"$work/output"
    expect_text '"class": "KORVA_OperatingSystem"' "$(cat "$work/output")"
    expect_text '"OSType": 36' "$(cat "$work/output")"
}

EverySymbolOfEveryLibraryIsFound() {
    install_tree
    for file in "$tree"/lib/*.so.1 "$tree"/lib/cmpi/*.so; do
        expect_success env -i LC_ALL=C /usr/bin/ldd -r "$file"
        expect_no_text "not found" "$output"
        expect_no_text "undefined symbol" "$output"
    done
}

HostAsksTheInstalledCompanionForComputerSystems() {
    install_tree
    host --format json ai KORVA_OperatingSystem --assoc-class KORVA_RunningOS >"$work/output"
    # Cmpihost itself would tell the keys only.
    expect_text '"NameFormat": "Other"' "$(cat "$work/output")"
}

TreeWorksWhereverItIsMovedTo() {
    install_tree
    mv "$tree" "$work/moved"
    expect_success env -i "$work/moved/bin/cmpihost" ein KORVA_OperatingSystem
    expect_text 'Name="' "$output"
}

LibrariesHaveTheirWordSize() {
    install_tree
    class=ELF$KORVA_WORD_SIZE
    for file in "$tree/bin/cmpihost" "$tree"/lib/*.so.1 "$tree"/lib/cmpi/*.so; do
        readelf -h "$file" | grep -q "Class: *$class\$" || fail "$file is not $class"
    done
}

LibrariesAreLookedForBesideTheProviderOnly() {
    install_tree
    for file in "$tree"/lib/*.so.1 "$tree"/lib/cmpi/*.so "$tree/bin/cmpihost"; do
        readelf -d "$file" | sed -n 's/.*R.*PATH.*\[\(.*\)\]/\1/p' | tr ':' '\n' >"$work/paths"
        while read -r path; do
            case $path in
                \$ORIGIN | \$ORIGIN/..) ;;
                *) fail "$file looks for libraries in '$path'" ;;
            esac
        done <"$work/paths"
    done
}

ComponentsShareNoFile() {
    for component in provider companion development tools $([ "$KORVA_WORD_SIZE" = 32 ] || echo server); do
        destination=$work/$component
        install_tree --component "$component"
        listing "$work/$component" >"$work/$component.list"
    done
    cat "$work"/*.list >"$work/all"
    expect_equal "what two components hold" "" "$(sort "$work/all" | uniq -d)"
    grep -v '^usr/share/doc' "$work/all" | LC_ALL=C sort >"$work/sorted"
    expect_equal "all components" "$(expected_files)" "$(cat "$work/sorted")"
}

RegisterCommandFindsItsFiles() {
    install_tree
    mkdir "$work/bin"
    for name in sfcbstage sfcbunstage sfcbrepos; do ln -s /bin/true "$work/bin/$name"; done
    expect_success env PATH="$work/bin:$PATH" "$tree/sbin/korva-osstatus-register" --cimom sfcb register
    expect_text "$tree/share/korva-osstatus/schema/KORVA_OperatingSystem.mof" "$output"
}

ConfigurationExampleIsInOrder() {
    install_tree
    sed "s|/var/log/|$work/|" "$tree/share/korva-osstatus/examples/zblog.conf" >"$work/zblog.conf"
    expect_success env -i ZBLOG_CONF="$work/zblog.conf" "$tree/bin/cmpihost" ein KORVA_OperatingSystem
    expect_text " trace 4000 Zumbrel.OperatingSystemProvider " "$(cat "$work/korva-osstatus.log")"
    expect_equal "the mode of the file" 640 "$(stat -c %a "$work/korva-osstatus.log")"
}

RotationCoversTheFileOfTheExample() {
    install_tree
    named=$(sed -n 's/^trace.sink *= file://p' "$tree/share/korva-osstatus/examples/zblog.conf")
    pattern=$(sed -n 's/ {$//p' "$destination/etc/logrotate.d/korva-osstatus")
    # The pattern is meant to be one.
    # shellcheck disable=SC2254
    case $named in
        $pattern) ;;
        *) fail "$pattern does not cover $named" ;;
    esac
}

# An agent of somebody else's, which uses all three libraries.
write_agent() {
    mkdir "$work/agent"
    cat >"$work/agent/agent.cpp" <<'EOF'
#include <Instrumentation.h>
#include <Moniker.h>
#include <ZBLogger.h>
#include <ZBMessageBuffer.h>
#include <cmpi/cmpimacs.h>
#include <ProviderUtilities.h>

#include <iostream>

int main() {
    VA::Instrumentation cursor;
    std::string name;
    cursor.selectNode(VA::NodeLexicon::OperatingSystemNode);
    cursor.getComputerName(name);
    VA::Moniker moniker;
    moniker.addKey("Name", name);
    moniker.selectKey(0);
    moniker.getValue(name);
    ZBLog::ZBMessageBuffer record;
    ZBLog::ZBLogger::traceLevelMessage("main", "agent.cpp", 1, "Agent", 4000, nullptr, 0, 0,
                                       record.str(record << "name: " << name.c_str()));
    std::cout << name << ' ' << VA::ProviderUtilities::getClassId("KORVA_OperatingSystem") << ' ' << CMPI_RC_OK << '\n';
}
EOF
    cat >"$work/agent/CMakeLists.txt" <<'EOF'
cmake_minimum_required(VERSION 3.25)
project(agent LANGUAGES CXX)
find_package(KorvaFramework 1.0 REQUIRED)
add_executable(agent agent.cpp)
target_link_libraries(agent PRIVATE korva::vaprovider korva::vainstrumentation korva::zblog)
EOF
}

AgentIsBuiltWithTheCMakePackage() {
    install_tree
    write_agent
    expect_success cmake -S "$work/agent" -B "$work/build" -DCMAKE_PREFIX_PATH="$tree" \
        -DCMAKE_CXX_FLAGS="-m$KORVA_WORD_SIZE"
    expect_success cmake --build "$work/build"
    expect_success env -i "$work/build/agent"
    expect_equal "the agent's output" "$(uname -n) 55 0" "$output"
}

# The libraries ask for the language of their headers themselves.
AgentOfAnOlderLanguageIsBuiltInThatOfTheHeaders() {
    install_tree
    write_agent
    expect_success cmake -S "$work/agent" -B "$work/build" -DCMAKE_PREFIX_PATH="$tree" \
        -DCMAKE_CXX_FLAGS="-m$KORVA_WORD_SIZE" -DCMAKE_CXX_STANDARD=14
    expect_success cmake --build "$work/build"
}

CMakePackageOfAnotherWordSizeIsRefused() {
    install_tree
    write_agent
    capture cmake -S "$work/agent" -B "$work/build" -DCMAKE_PREFIX_PATH="$tree" \
        -DCMAKE_CXX_FLAGS="-m$((96 - KORVA_WORD_SIZE))"
    [ "$code" -ne 0 ] || fail "the libraries of the wrong word size were taken"
    expect_text "$KORVA_WORD_SIZE""bit" "$output"
}

AgentIsBuiltWithPkgConfig() {
    need_tool pkg-config pkg-config
    install_tree
    write_agent
    flags=$(PKG_CONFIG_PATH="$tree/lib/pkgconfig" pkg-config --cflags --libs vaprovider vainstrumentation zblog)
    # Flags, without blanks in them.
    # shellcheck disable=SC2086
    expect_success g++ -std=c++17 "-m$KORVA_WORD_SIZE" "$work/agent/agent.cpp" $flags -o "$work/agent/agent"
    expect_success env -i LD_LIBRARY_PATH="$tree/lib" "$work/agent/agent"
    expect_equal "the agent's output" "$(uname -n) 55 0" "$output"
}

# configure OPTION...: a tree of its own in $work/build, which is not built.
configure() {
    expect_success cmake -G Ninja -S "$KORVA_SOURCE_DIR" -B "$work/build" -DBUILD_TESTING=OFF \
        -DKORVA_WORD_SIZE="$KORVA_WORD_SIZE" "$@"
}

ProvidersFollowTheLibrariesToAnotherFolder() {
    configure -DCMAKE_INSTALL_LIBDIR=lib64
    grep -qx "KORVA_CMPI_LIBDIR:STRING=lib64/cmpi" "$work/build/CMakeCache.txt" ||
        fail "the providers do not go to lib64/cmpi"
    expect_text "libdir=\${prefix}/lib64" "$(cat "$work/build/generated/zblog.pc")"
    # Packages of both word sizes share this one.
    expect_success cmp "$work/build/generated/register/libraries.sh" "$KORVA_BINARY_DIR/generated/register/libraries.sh"
}

HostKnowsAnotherFolderOfTheProviders() {
    configure -DKORVA_CMPI_LIBDIR=agents/cim
    grep -F 'InstallPaths.cpp' "$work/build/compile_commands.json" >"$work/compiled"
    expect_text 'KORVA_CMPI_FOLDER=\\\"agents/cim\\\"' "$(cat "$work/compiled")"
}

LibrariesOfDebianGoToTheFolderOfTheirArchitecture() {
    architecture=x86_64
    [ "$KORVA_WORD_SIZE" = 64 ] || architecture=i386
    configure -DCMAKE_INSTALL_PREFIX=/usr
    expect_text "libdir=\${prefix}/lib/$architecture-linux-gnu" "$(cat "$work/build/generated/zblog.pc")"
    grep -qx "KORVA_CMPI_LIBDIR:STRING=lib/cmpi" "$work/build/CMakeCache.txt" ||
        fail "the providers do not go to lib/cmpi"
}
