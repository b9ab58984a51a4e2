# How object managers learn of the provider and its companion: classes, registrations, and the command
# that hands them over. The build tree holds them at the same places as an installed one.
set(korva_registration_dir "${KORVA_SHARE_DIR}/registration")
set(korva_registration_source "${PROJECT_SOURCE_DIR}/schema/registration")

# korva_registration(<component> <stem>): the registrations for both object managers.
function(korva_registration component stem)
    set(folder "${CMAKE_BINARY_DIR}/${korva_registration_dir}")
    configure_file("${korva_registration_source}/${stem}.reg" "${folder}/${stem}.reg" COPYONLY)
    configure_file("${korva_registration_source}/${stem}-pegasus.mof.in"
                   "${folder}/${stem}-pegasus.mof" @ONLY)
    install(FILES "${folder}/${stem}.reg" "${folder}/${stem}-pegasus.mof"
            DESTINATION "${korva_registration_dir}" COMPONENT ${component})
endfunction()

korva_registration(provider korva-osstatus)
korva_registration(companion korva-osstatus-companion)

file(GLOB korva_classes CONFIGURE_DEPENDS "${PROJECT_SOURCE_DIR}/schema/*.mof")
install(FILES ${korva_classes} DESTINATION "${KORVA_SHARE_DIR}/schema" COMPONENT provider)

set(korva_register "${PROJECT_SOURCE_DIR}/packaging/korva-osstatus-register")
configure_file("${korva_register}" "${CMAKE_BINARY_DIR}/sbin/korva-osstatus-register" COPYONLY)
install(PROGRAMS "${korva_register}" DESTINATION "${CMAKE_INSTALL_SBINDIR}" COMPONENT provider)
set(korva_register_source "${PROJECT_SOURCE_DIR}/packaging/register")
set(korva_register_dir "${CMAKE_BINARY_DIR}/${KORVA_SHARE_DIR}/register")
foreach(part parts client sfcb sfcb-broker pegasus-server pegasus)
    configure_file("${korva_register_source}/${part}.sh" "${korva_register_dir}/${part}.sh" COPYONLY)
    install(FILES "${korva_register_source}/${part}.sh"
            DESTINATION "${KORVA_SHARE_DIR}/register" COMPONENT provider)
endforeach()

# The libraries are elsewhere when they are installed.
set(KORVA_REGISTERED_FOLDERS lib)
configure_file("${korva_register_source}/libraries.sh.in" "${korva_register_dir}/libraries.sh" @ONLY)
set(KORVA_REGISTERED_FOLDERS "\"${KORVA_MANAGER_LIBDIR}\"")
if(KORVA_MANAGER_LIBDIR MATCHES "^lib(64)?/cmpi$")
    set(KORVA_REGISTERED_FOLDERS "lib64/cmpi lib/cmpi")
endif()
configure_file("${korva_register_source}/libraries.sh.in"
               "${CMAKE_BINARY_DIR}/generated/register/libraries.sh" @ONLY)
install(FILES "${CMAKE_BINARY_DIR}/generated/register/libraries.sh"
        DESTINATION "${KORVA_SHARE_DIR}/register" COMPONENT provider)
