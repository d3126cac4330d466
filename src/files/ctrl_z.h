// Old systems end a file with it, and append to such a file behind it.
#pragma once

namespace partnerkit {

inline constexpr char kCtrlZ = '\x1A';

}  // namespace partnerkit
