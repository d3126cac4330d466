// What every translator keeps between calls and does alike, beside what every public class does: the binding to one
// document definition.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "frame/hosted_class.h"
#include "partnerkit/translator.h"

namespace partnerkit {

class TranslatorBase : public Translator, public HostedClass {
 public:
  std::string_view ProgId() const override { return OwnProgId(); }
  LogRecord Log() const override;

  const EDIDoc& Document() const { return document_; }
  const Partner& TradingPartner() const { return partner_; }
  const Vendor& OwnCompany() const { return vendor_; }

 protected:
  TranslatorBase(std::string_view className, const Ports& ports, std::string_view moduleLabel = {})
      : HostedClass(className, ports, moduleLabel) {}

  // Keeps the host and reads the document definition with its partner and vendor. Whether they are there is not tested:
  // an unknown document has no addresses, so that nothing matches it.
  void Bind(System& system, std::int16_t documentId);

 private:
  EDIDoc document_;
  Partner partner_;
  Vendor vendor_;
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

  void Note(std::int32_t number, std::string_view message) { Note(number, procedure_, message); }
  void Note(std::int32_t number, std::string_view procedure, std::string_view message) {
    const std::int32_t id = translator_.WriteLog(number, procedure, message);
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
