#ifndef HOST_SERVER_SERVICE_MANAGER_H
#define HOST_SERVER_SERVICE_MANAGER_H

#include <string>
#include <vector>

#include "base/FileDescriptor.h"

/// What a service manager (systemd) hands over to a service and is told by it. Both go by
/// environment variables, for one thread: the environment knows no locks.
namespace cmpihost::server {

/// The listening sockets that were passed on (LISTEN_PID, LISTEN_FDS), closed on execution from now
/// on; none where they are another process's. The variables are gone afterwards. Throws
/// std::runtime_error for one that is no listening stream socket.
std::vector<base::FileDescriptor> takePassedSockets();

/// The state of a service that reads its configuration again, with the time that goes with it.
std::string reloadingState();

/// Tells the service manager a state, lines of NAME=VALUE, where it wants to know (NOTIFY_SOCKET).
void notifyServiceManager(const std::string& state) noexcept;

}  // namespace cmpihost::server

#endif
