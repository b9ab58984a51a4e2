# Read by cpack. Each package has a summary of its own; this one would stand before it.
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "")
