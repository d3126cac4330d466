// The ports of this platform: real files, the system's clock and name.
#pragma once

#include "partnerkit/ports.h"

namespace partnerkit::platform {

// Ports on POSIX files and the system's clock, with no error dialog (every fault leaves its procedure). The objects
// live as long as the program.
Ports DefaultPorts();

}  // namespace partnerkit::platform
