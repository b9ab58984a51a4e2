#ifndef HOST_SERVER_INTEROP_CLASSES_H
#define HOST_SERVER_INTEROP_CLASSES_H

namespace cmpihost::server {

/// The MOF of the classes of the interop namespace: of the CIM schema's classes what is served.
extern const char* const interopMof;

}  // namespace cmpihost::server

#endif
