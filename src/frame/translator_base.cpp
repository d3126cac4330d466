#include "frame/translator_base.h"

namespace partnerkit {

void TranslatorBase::Bind(System& system, std::int16_t documentId) {
  PROCESSALL = false;
  SetHost(system);
  document_ = {};
  document_.EDIDocId = documentId;
  Try([&] { return partnerkit::Load(Records(), document_); });
  partner_ = {};
  partner_.PartnerId = document_.PartnerId;
  Try([&] { return partnerkit::Load(Records(), partner_); });
  vendor_ = {};
  vendor_.VendorId = document_.VendorId;
  Try([&] { return partnerkit::Load(Records(), vendor_); });
}

LogRecord TranslatorBase::Log() const {
  LogRecord log;
  log.LogId = LastLogId();
  return log;
}

}  // namespace partnerkit
