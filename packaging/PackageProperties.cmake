# Read by cpack once for each kind of package.
if(CPACK_GENERATOR STREQUAL "DEB")
    # Each package has a summary of its own; this one would stand before it.
    set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "")
else()
    list(FILTER CPACK_COMPONENTS_ALL EXCLUDE REGEX "^debian-")
    # CPack has no variable for these. A 64-bit system may lack the 32-bit libsystemd, through which the
    # state of the system comes.
    set(korva_isa x86-64)
    if(CPACK_RPM_PACKAGE_ARCHITECTURE STREQUAL "i686")
        set(korva_isa x86-32)
    endif()
    string(APPEND CPACK_RPM_SPEC_MORE_DEFINE "
%if \"%{name}\" == \"korva-osstatus-provider\"
Recommends: systemd-libs(${korva_isa})
Suggests: korva-osstatus-companion, logrotate
%endif")
endif()
