# Man pages, the completion of the shells, documents, the example of a logging configuration, and the rotation of log files.
find_program(KORVA_GZIP gzip REQUIRED)

# korva_gzip(<file> <compressed file>): without name and time, so that every build gives the same.
function(korva_gzip file compressed)
    add_custom_command(OUTPUT "${compressed}" DEPENDS "${file}" VERBATIM
        COMMAND sh -c "exec \"$0\" -9 -n -c \"$1\" > \"$2\"" "${KORVA_GZIP}" "${file}" "${compressed}")
endfunction()

# korva_man_page(<component> <name> <section>)
function(korva_man_page component name section)
    set(folder "${CMAKE_BINARY_DIR}/share/man/man${section}")
    file(MAKE_DIRECTORY "${folder}")
    set(compressed "${folder}/${name}.${section}.gz")
    korva_gzip("${PROJECT_SOURCE_DIR}/docs/man/${name}.${section}" "${compressed}")
    add_custom_target(korva_man_${name} ALL DEPENDS "${compressed}")
    install(FILES "${compressed}" DESTINATION "${CMAKE_INSTALL_MANDIR}/man${section}"
            COMPONENT ${component})
endfunction()

if(KORVA_CMPIHOST)
    korva_man_page(tools cmpihost 1)
    install(FILES "${PROJECT_SOURCE_DIR}/completion/cmpihost.bash" RENAME cmpihost
            DESTINATION "${CMAKE_INSTALL_DATADIR}/bash-completion/completions" COMPONENT tools)
    install(FILES "${PROJECT_SOURCE_DIR}/completion/_cmpihost"
            DESTINATION "${CMAKE_INSTALL_DATADIR}/zsh/site-functions" COMPONENT tools)
    # The licences of the libraries whose code is in it want to go along.
    install(FILES "${PROJECT_SOURCE_DIR}/packaging/debian/korva-osstatus-tools.copyright" RENAME copyright.cmpihost
            DESTINATION "${CMAKE_INSTALL_DOCDIR}" COMPONENT tools)
endif()
if(TARGET cmpihost-serve)
    korva_man_page(server cmpihost-serve 1)
    install(FILES "${PROJECT_SOURCE_DIR}/packaging/debian/korva-osstatus-server.copyright"
            RENAME copyright.cmpihost-serve DESTINATION "${CMAKE_INSTALL_DOCDIR}" COMPONENT server)
    # The units name the program by its whole path.
    foreach(unit korva-osstatus-server.service korva-osstatus-server.socket)
        set(source "${PROJECT_SOURCE_DIR}/packaging/debian/${unit}")
        set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS "${source}")
        file(READ "${source}" text)
        string(REPLACE "=/usr/bin/cmpihost-serve" "=${CMAKE_INSTALL_FULL_BINDIR}/cmpihost-serve" text "${text}")
        file(GENERATE OUTPUT "${CMAKE_BINARY_DIR}/generated/${unit}" CONTENT "${text}")
        install(FILES "${CMAKE_BINARY_DIR}/generated/${unit}" DESTINATION lib/systemd/system COMPONENT server)
    endforeach()
endif()
korva_man_page(provider zblog.conf 5)
korva_man_page(provider korva-osstatus 7)
korva_man_page(provider korva-osstatus-register 8)

# Documents for users, in the folders of the source, so that the links from one to another hold. Those for
# developers (docs/dev, CONTRIBUTING.md) stay with the source.
file(GLOB korva_documents CONFIGURE_DEPENDS "${PROJECT_SOURCE_DIR}/docs/*.md" "${PROJECT_SOURCE_DIR}/docs/*.schema.json")
install(FILES ${korva_documents} DESTINATION "${CMAKE_INSTALL_DOCDIR}/docs" COMPONENT provider)
install(FILES "${PROJECT_SOURCE_DIR}/README.md" "${PROJECT_SOURCE_DIR}/CHANGELOG.md"
              "${PROJECT_SOURCE_DIR}/SECURITY.md" "${PROJECT_SOURCE_DIR}/LICENSE"
        DESTINATION "${CMAKE_INSTALL_DOCDIR}" COMPONENT provider)
install(FILES "${PROJECT_SOURCE_DIR}/packaging/examples/zblog.conf"
        DESTINATION "${KORVA_SHARE_DIR}/examples" COMPONENT provider)

# A tree in /usr is configured by /etc. The prefix may be named as late as on installation.
set(KORVA_LOGROTATE_SNIPPET "${PROJECT_SOURCE_DIR}/packaging/logrotate/korva-osstatus")
configure_file("${PROJECT_SOURCE_DIR}/packaging/logrotate/install.cmake.in"
               "${CMAKE_BINARY_DIR}/generated/install-logrotate.cmake" @ONLY)
install(SCRIPT "${CMAKE_BINARY_DIR}/generated/install-logrotate.cmake" COMPONENT provider)
