// The last line of defence: tells an error that no procedure foresaw, and says what becomes of the procedure it arose
// in.
#pragma once

#include <string>
#include <string_view>

#include "partnerkit/ports.h"

namespace partnerkit {

enum class Answer {
  kRetry = 1,  // run the failing operation again
  kNext = 2,   // go on with the one after it
  kLeave = 3,  // leave the procedure, its result as it stands
};

class ErrorTrail {
 public:
  // `files` must outlive the trail.
  ErrorTrail(ErrorOutlets outlets, ErrorSettings settings, Files& files);

  // Puts the error through every outlet that is set up, then asks. A failing outlet is passed over in silence, so that
  // one error never becomes two; without an answer the procedure is left. Raises RunTimeError only to pass the error
  // upward.
  Answer operator()(std::string_view module, std::string_view procedure, const RunTimeError& error) const;

 private:
  ErrorReport Report(std::string_view module, std::string_view procedure, const RunTimeError& error) const;
  std::string RemoteSuffix(const std::string& source) const;
  void ShowOnMonitor(const ErrorReport& report) const;
  void AppendToLogFile(const ErrorReport& report) const;
  void SendMail(const ErrorReport& report) const;
  Answer Ask(const ErrorReport& report) const;
  RunTimeError PassedUpward(const ErrorReport& report, const std::string& source) const;

  ErrorOutlets outlets_;
  ErrorSettings settings_;
  Files& files_;
};

}  // namespace partnerkit
