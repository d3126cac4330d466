#include "frame/hosted_class.h"

#include <atomic>

#include "frame/live_objects.h"

namespace partnerkit {

namespace {

std::atomic<std::int64_t> liveObjects{0};

std::string ModuleLabel(std::string_view className, std::string_view given) {
  return given.empty() ? "c" + std::string(className.substr(3)) : std::string(given);
}

}  // namespace

std::int64_t LiveObjects() { return liveObjects.load(); }

HostedClass::HostedClass(std::string_view className, const Ports& ports, std::string_view moduleLabel)
    : errors_(ModuleLabel(className, moduleLabel), ports),
      ports_(ports),
      progId_("PartnerKit." + std::string(className)) {
  ++liveObjects;
}

HostedClass::~HostedClass() { --liveObjects; }

void HostedClass::Tell(Told kind, const std::string& sentence) {
  if (ports_.tell) ports_.tell(kind, sentence);
  else WriteLog(kWarning, "Tell", sentence);
}

std::int32_t HostedClass::WriteLog(std::int32_t number, std::string_view procedure, std::string_view message) {
  const std::int32_t native = number == run_time::kDatabase ? Records().NativeError() : 0;
  return Procedure("Sub WriteLog", std::int32_t{0}, [&](std::int32_t& id) {
    Log log;
    log.LogDate = ports_.clock->Now();
    log.UserId = Try([&] { return system_->UserId(); });
    if (ports_.computerName) log.ComputerName = ports_.computerName();
    log.Source = progId_;
    log.Procedure = std::string(procedure);
    log.ErrorNumber = number;
    log.NativeError = native;
    log.Message = std::string(message);
    Try([&] {
      if (Add(Records(), log)) return;
      throw RunTimeError(run_time::kDatabase,
                         "The run log cannot be written, database error " + std::to_string(Records().NativeError()));
    });
    id = lastLogId_ = log.LogId;
  });
}

}  // namespace partnerkit
