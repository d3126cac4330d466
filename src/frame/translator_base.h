// What every translator keeps between calls and does alike: the binding to the host, the run log, and the handler under
// which its procedures run.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>
#include <vector>

#include "frame/procedure.h"
#include "partnerkit/translator.h"

namespace partnerkit {

// Kinds of log record, by number. Any other number is the run-time error at that moment.
inline constexpr std::int32_t kInformation = 0;
inline constexpr std::int32_t kWarning = static_cast<std::int32_t>(0x80040001);    // the run goes on
inline constexpr std::int32_t kRejection = static_cast<std::int32_t>(0x80040002);  // the row is not posted

class TranslatorBase : public Translator {
 public:
  ~TranslatorBase() override;

  std::string_view ProgId() const override { return progId_; }
  LogRecord Log() const override;

  // Writes one record to the host's run log and gives its id, 0 when it could not be written; that never fails the
  // operation that called it. For the database layer's error the record carries the database's own number as well.
  std::int32_t WriteLog(std::int32_t number, std::string_view procedure, std::string_view message);

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

  System& Host() const { return *system_; }
  RecordStore& Records() const { return system_->Records(); }
  Files& FileSystem() const { return *ports_.files; }
  DateTime Now() const { return ports_.clock->Now(); }
  Clock& WallClock() const { return *ports_.clock; }
  const ComponentFactory& Components() const { return ports_.components; }
  const EDIDoc& Document() const { return document_; }
  const Partner& TradingPartner() const { return partner_; }
  const Vendor& OwnCompany() const { return vendor_; }

 protected:
  // `className` is "clsMGB850csv"; the error trail knows the class as `moduleLabel`, "cMGB850csv" when it is empty.
  TranslatorBase(std::string_view className, const Ports& ports, std::string_view moduleLabel = {});

  // Keeps the host and reads the document definition with its partner and vendor. Whether they are there is not tested:
  // an unknown document has no addresses, so that nothing matches it.
  void Bind(System& system, std::int16_t documentId);

 private:
  ErrorHandling errors_;
  Ports ports_;
  std::string progId_;
  System* system_ = nullptr;
  EDIDoc document_;
  Partner partner_;
  Vendor vendor_;
  std::int32_t lastLogId_ = 0;
};

// The log records of one call: what the caller's error list holds when the call ends, on every path. A call that wrote
// none leaves the list as it was.
class CallLog {
 public:
  CallLog(TranslatorBase& translator, std::string_view procedure, ErrorList& list)
      : translator_(translator), procedure_(procedure), list_(list) {}
  ~CallLog() {
    if (!ids_.empty()) list_ = std::move(ids_);
  }
  CallLog(const CallLog&) = delete;
  CallLog& operator=(const CallLog&) = delete;

  void Note(std::int32_t number, std::string_view message) {
    const std::int32_t id = translator_.WriteLog(number, procedure_, message);
    if (id != 0) ids_.push_back(id);
  }
  // What the caller will be shown, for another component to add to.
  std::vector<std::int32_t>& Ids() { return ids_; }

 private:
  TranslatorBase& translator_;
  std::string_view procedure_;
  ErrorList& list_;
  std::vector<std::int32_t> ids_;
};

}  // namespace partnerkit
