// What every public class keeps between calls and does alike, whatever its contract: the host, the run log, and the
// handler under which its procedures run.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

#include "frame/procedure.h"
#include "partnerkit/ports.h"
#include "partnerkit/records.h"
#include "partnerkit/store.h"

namespace partnerkit {

// Kinds of log record, by number. Any other number is the run-time error at that moment.
inline constexpr std::int32_t kInformation = 0;
inline constexpr std::int32_t kWarning = static_cast<std::int32_t>(0x80040001);    // the run goes on
inline constexpr std::int32_t kRejection = static_cast<std::int32_t>(0x80040002);  // the row is not posted

class HostedClass {
 public:
  HostedClass(const HostedClass&) = delete;
  HostedClass& operator=(const HostedClass&) = delete;

  // Writes one record to the host's run log and gives its id, 0 when it could not be written; that never fails the
  // operation that called it. For the database layer's error the record carries the database's own number as well.
  std::int32_t WriteLog(std::int32_t number, std::string_view procedure, std::string_view message);

  // Tells the user something about his files, see Ports::tell.
  void Tell(Told kind, const std::string& sentence);

  // The run-time error of the last operation that failed in a foreseen way, 0 when none did.
  std::int32_t ErrorNumber() const { return errors_.Number(); }

  // One primitive operation (open, read, write, a store call): its result, or a default-made one when it failed and the
  // run goes on behind it.
  template <class F>
  auto Try(F operation) {
    using Result = std::invoke_result_t<F>;
    if constexpr (std::is_void_v<Result>) {
      return Attempt(errors_, std::move(operation));
    } else {
      Result result{};
      Attempt(errors_, [&] { result = operation(); });
      return result;
    }
  }

  // A procedure: the body runs under the standard handler and leaves its answer in `result`.
  template <class R, class F>
  R Procedure(std::string_view label, R initial, F body) {
    return Guarded(errors_, label, std::move(initial), std::move(body));
  }
  ErrorHandling& Errors() { return errors_; }

  // "PartnerKit.clsMGB850csv".
  const std::string& OwnProgId() const { return progId_; }

  System& Host() const { return *system_; }
  RecordStore& Records() const { return system_->Records(); }
  Files& FileSystem() const { return *ports_.files; }
  Clock& WallClock() const { return *ports_.clock; }
  DateTime Now() const { return ports_.clock->Now(); }
  const ComponentFactory& Components() const { return ports_.components; }
  // Null when the host has none.
  Spooler* PrintSpooler() const { return ports_.spooler; }
  // Lets the host see to its own events.
  void Yield() const {
    if (ports_.yield) ports_.yield();
  }

 protected:
  // `className` is "clsMGB850csv"; the error trail knows the class as `moduleLabel`, "cMGB850csv" when it is empty.
  HostedClass(std::string_view className, const Ports& ports, std::string_view moduleLabel = {});
  ~HostedClass();

  void SetHost(System& system) { system_ = &system; }
  std::int32_t LastLogId() const { return lastLogId_; }

 private:
  ErrorHandling errors_;
  Ports ports_;
  std::string progId_;
  System* system_ = nullptr;
  std::int32_t lastLogId_ = 0;
};

}  // namespace partnerkit
