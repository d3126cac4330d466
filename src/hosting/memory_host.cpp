#include "partnerkit/memory_host.h"

namespace partnerkit {

std::optional<std::string> MemoryHost::Setting(std::string_view name) {
  const auto found = settings_.find(name);
  return found == settings_.end() ? std::nullopt : std::optional(found->second);
}

void MemoryHost::SetSetting(std::string_view name, std::string_view value) {
  settings_.insert_or_assign(std::string(name), std::string(value));
}

void MemoryHost::OpenTransaction() {
  store_.BeginTrans();
  settingsBefore_ = settings_;
}

void MemoryHost::CloseTransaction(bool keep) {
  if (keep) return store_.CommitTrans();
  store_.RollbackTrans();
  settings_ = settingsBefore_;
}

}  // namespace partnerkit
