#include "partnerkit/records.h"
#include "partnerkit/run_time_error.h"
#include "partnerkit/store.h"
#include "values/numbers.h"

namespace partnerkit {

void System::ComSend(std::string_view) {
  throw RunTimeError(run_time::kDeviceError, "This host has no port for direct labels");
}

std::vector<std::shared_ptr<Pack>> System::PacksToCompile(std::string_view, std::string_view) { return {}; }

bool System::StampPack(std::int32_t packId, std::int32_t noticeId) {
  constexpr std::int32_t kCompiled = 8;
  Pack pack;
  pack.Id = packId;
  if (!Load(Records(), pack) || pack.Status >= kCompiled) return false;
  pack.ASNId = noticeId;
  pack.Status = kCompiled;
  if (Update(Records(), pack)) return true;
  throw RunTimeError(run_time::kDatabase,
                     "A pack cannot be stamped, database error " + std::to_string(Records().NativeError()));
}

bool System::ComDirect() {
  const std::string set = SettingText("ComDirect");
  return set == "true" || set == "1";
}

std::int32_t System::PlatformId() { return ToLong(NumberAtStart(SettingText("PlatformId"))); }

}  // namespace partnerkit
