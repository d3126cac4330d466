// The ports of this platform: real files, the system's clock and name.
#pragma once

#include "partnerkit/ports.h"

namespace partnerkit::platform {

// Ports on POSIX files and the system's clock. The objects live as long as the program. There is no error dialog: a
// fault leaves its procedure, and nothing tells of it. Set `errorOutlets.dialog` to learn of faults, and `tell` of what
// happens to files.
Ports DefaultPorts();

}  // namespace partnerkit::platform
