#include "cairo/handles.h"

#include "partnerkit/run_time_error.h"
#include "platform/posix_calls.h"

namespace partnerkit::cairo {

void Check(cairo_status_t status, const std::string& what) {
  if (status == CAIRO_STATUS_SUCCESS) return;
  const bool memory = status == CAIRO_STATUS_NO_MEMORY;
  platform::Raise(memory ? run_time::kOutOfMemory : run_time::kDeviceError, what, cairo_status_to_string(status));
}

void RaiseInvalidCall(const std::string& cause) {
  throw RunTimeError(run_time::kInvalidCall,
                     "Invalid procedure call or argument" + (cause.empty() ? "" : ": " + cause));
}

}  // namespace partnerkit::cairo
