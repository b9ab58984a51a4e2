# What `cmake --install` puts where. Components: provider (the provider, the framework's libraries,
# schema and registration), companion, development, tools, server. Install*.cmake hold one subject each.

set(KORVA_SHARE_DIR share/korva-osstatus)

include(InstallLibraries)
include(InstallDevelopment)
include(InstallRegistration)
include(InstallDocuments)
