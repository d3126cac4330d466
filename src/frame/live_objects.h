// How many objects of the library are alive: what tells a host whether the shared library may be unloaded.
#pragma once

#include <cstdint>

namespace partnerkit {

std::int64_t LiveObjects();

}  // namespace partnerkit
