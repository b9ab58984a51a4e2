# The libraries and the host.
set(KORVA_FRAMEWORK vaprovider vainstrumentation zblog)

install(TARGETS ${KORVA_FRAMEWORK} EXPORT KorvaFrameworkTargets
        LIBRARY DESTINATION "${CMAKE_INSTALL_LIBDIR}"
            COMPONENT provider NAMELINK_COMPONENT development)

# Object managers open the name without a version.
install(TARGETS korvaosstatusfacade korzbosstatusprofileprovider
        LIBRARY DESTINATION "${KORVA_CMPI_LIBDIR}" COMPONENT provider)
install(TARGETS korvacomputersystemprovider
        LIBRARY DESTINATION "${KORVA_CMPI_LIBDIR}" COMPONENT companion)

# The framework is beside them where they are built, and elsewhere where they are installed.
if(IS_ABSOLUTE "${KORVA_CMPI_LIBDIR}")
    set(korva_framework_folder "${CMAKE_INSTALL_FULL_LIBDIR}")
else()
    file(RELATIVE_PATH korva_framework_folder "/${KORVA_CMPI_LIBDIR}" "/${CMAKE_INSTALL_LIBDIR}")
    string(REGEX REPLACE "/$" "" korva_framework_folder "$ORIGIN/${korva_framework_folder}")
endif()
set_target_properties(korvaosstatusfacade korzbosstatusprofileprovider korvacomputersystemprovider
    PROPERTIES INSTALL_RPATH "$ORIGIN;${korva_framework_folder}")

if(KORVA_CMPIHOST)
    install(TARGETS cmpihost RUNTIME DESTINATION "${CMAKE_INSTALL_BINDIR}" COMPONENT tools)
endif()
if(TARGET cmpihost-serve)
    install(TARGETS cmpihost-serve RUNTIME DESTINATION "${CMAKE_INSTALL_BINDIR}" COMPONENT server)
endif()
