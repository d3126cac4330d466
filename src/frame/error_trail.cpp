#include "frame/error_trail.h"

#include <algorithm>
#include <utility>

#include "values/numbers.h"

namespace partnerkit {

namespace {

// The line of the failing operation, which compiled code cannot tell; the reports keep its place.
constexpr std::string_view kLine = "0";

constexpr std::string_view kMailedFile = "!error!.log";

template <class F>
void Quietly(F step) {
  try {
    step();
  } catch (...) {
  }
}

// How many components an error came up through, 0 for one of this library.
double Hops(const std::string& source) { return NumberAtStart(source); }

void WriteLine(OutputFile& file, const std::string& text) {
  file.Write(text + "\r\n");
  file.Close();
}

}  // namespace

ErrorTrail::ErrorTrail(ErrorOutlets outlets, ErrorSettings settings, Files& files)
    : outlets_(std::move(outlets)), settings_(std::move(settings)), files_(files) {}

Answer ErrorTrail::operator()(std::string_view module, std::string_view procedure, const RunTimeError& error) const {
  const ErrorReport report = Report(module, procedure, error);
  Quietly([&] { ShowOnMonitor(report); });
  Quietly([&] { AppendToLogFile(report); });
  Quietly([&] { SendMail(report); });
  if (settings_.silent) return Answer::kLeave;
  if (settings_.passUpward) throw PassedUpward(report, error.Source());
  Answer answer = Answer::kLeave;
  Quietly([&] { answer = Ask(report); });
  return answer;
}

ErrorReport ErrorTrail::Report(std::string_view module, std::string_view procedure, const RunTimeError& error) const {
  ErrorReport report{error.Number(), error.Description(), std::string(module), std::string(procedure), {}};
  std::string suffix;
  Quietly([&] { suffix = RemoteSuffix(error.Source()); });
  report.report = "TLE error - program error #" + std::to_string(report.number) + " (" + report.description +
                  ") occured in module " + report.module + ", " + report.procedure + ", line " + std::string(kLine) +
                  suffix;
  return report;
}

// Two shapes of source come up: this library's hop text, which leads with the library's path and holds four "!" a hop,
// and the bare "number!component!procedure" of others.
std::string ErrorTrail::RemoteSuffix(const std::string& source) const {
  if (Hops(source) == 0) return ".";
  const std::size_t first = source.find('!');
  if (first == std::string::npos) return {};
  const std::string component = std::ranges::count(source, '!') == 2
                                    ? source.substr(first + 1, source.find('!', first + 1) - first - 1)
                                    : source.substr(1, first - 1);
  return ". This error was generated remotely by " + component + ", a component of " + outlets_.libraryPath + ".";
}

void ErrorTrail::ShowOnMonitor(const ErrorReport& report) const {
  if (settings_.monitorWindow == 0 || !outlets_.monitor) return;
  outlets_.monitor(settings_.monitorWindow, "[" + outlets_.applicationName + "] ERROR " +
                                                std::to_string(report.number) + " \"" + report.description + "\" at " +
                                                report.module + " : " + report.procedure + " : " + std::string(kLine) +
                                                "\r\n");
}

void ErrorTrail::AppendToLogFile(const ErrorReport& report) const {
  if (!settings_.logToFile) return;
  const std::string name = settings_.logFileName.empty() ? "error.log" : settings_.logFileName;
  WriteLine(*files_.OpenOutput(name, OutputMode::kAppend), report.report);
}

// The mail goes out even when the file it encloses could not be written.
void ErrorTrail::SendMail(const ErrorReport& report) const {
  if (settings_.mailRecipient.empty() || !outlets_.mail) return;
  const std::string file(kMailedFile);
  // The old one goes, whatever it is: nothing is written through a link that somebody has put there.
  Quietly([&] { files_.Delete(file); });
  Quietly([&] { WriteLine(*files_.OpenOutput(file, OutputMode::kAppendOwn), report.report); });
  Quietly([&] {
    outlets_.mail({.recipient = settings_.mailRecipient,
                   .subject = "Remote Error Report From " + outlets_.libraryPath,
                   .note = "TLE error " + std::to_string(report.number) + " (" + report.description + ") occured in " +
                           outlets_.libraryPath + ". The attached log file has complete details.",
                   .type = "IPM.",
                   .attachmentPath = file,
                   .attachmentName = "fserror.log"});
  });
  files_.Delete(file);
}

Answer ErrorTrail::Ask(const ErrorReport& report) const {
  if (!outlets_.dialog) return Answer::kLeave;
  switch (outlets_.dialog(report, "Unexpected Error")) {
    case Button::kRetry:
      return Answer::kRetry;
    case Button::kIgnore:
      return Answer::kNext;
    case Button::kAbort:
      break;
  }
  return Answer::kLeave;
}

// The source counts the components passed in its first character and names each one behind the last.
RunTimeError ErrorTrail::PassedUpward(const ErrorReport& report, const std::string& source) const {
  double hops = 0;
  Quietly([&] { hops = Hops(source); });
  std::string hop = (hops == 0 ? "0" : source + "!") + outlets_.libraryPath;
  hop.replace(0, 1, NumberText(hops + 1));
  hop += "!" + report.module + "!" + report.procedure + "!" + std::string(kLine) + "!" + std::to_string(report.number);
  return {report.number,
          report.description + " in " + report.module + ", " + report.procedure + " at line number " +
              std::string(kLine) + "\r\n(handled remotely by NuMega FailSafe)",
          std::move(hop)};
}

}  // namespace partnerkit
