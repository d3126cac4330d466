// Where bytes go that are made piece by piece.
#pragma once

#include <functional>
#include <string_view>

namespace partnerkit {

using ByteSink = std::function<void(std::string_view bytes)>;

}  // namespace partnerkit
