# Read by cpack once for each kind of package.
if(CPACK_GENERATOR STREQUAL "DEB")
    # Each package has a summary of its own; this one would stand before it.
    set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "")
else()
    list(FILTER CPACK_COMPONENTS_ALL EXCLUDE REGEX "^debian-")
endif()
