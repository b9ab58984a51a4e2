# How object managers learn of the provider and its companion: classes, registrations, and the command
# that hands them over. The build tree holds them at the same places as an installed one.
set(korva_registration_dir "${KORVA_SHARE_DIR}/registration")
set(korva_registration_source "${PROJECT_SOURCE_DIR}/schema/registration")

# A 64-bit server must be told that a module needs its 32-bit agent.
set(KORVA_PEGASUS_BITNESS "")
if(KORVA_WORD_SIZE STREQUAL "32")
    set(KORVA_PEGASUS_BITNESS "\n   Bitness = 2;")
endif()

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
foreach(manager sfcb pegasus)
    set(source "${PROJECT_SOURCE_DIR}/packaging/register/${manager}.sh")
    configure_file("${source}" "${CMAKE_BINARY_DIR}/${KORVA_SHARE_DIR}/register/${manager}.sh"
                   COPYONLY)
    install(FILES "${source}" DESTINATION "${KORVA_SHARE_DIR}/register" COMPONENT provider)
endforeach()
