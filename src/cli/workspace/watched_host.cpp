#include "cli/workspace/watched_host.h"

#include <algorithm>

namespace partnerkit::cli {

bool WatchedHost::DeleteOrder(const Order& order) {
  if (!host_.DeleteOrder(order)) return false;
  ++ordersDeleted_;
  return true;
}

bool WatchedHost::Load(const RecordType& type, void* record) {
  if (&type == &Log::kType) {
    Log& wanted = *static_cast<Log*>(record);
    const auto kept = std::ranges::lower_bound(logs_, wanted.LogId, {}, &Log::LogId);
    if (kept != logs_.end() && kept->LogId == wanted.LogId) {
      wanted = *kept;
      return true;
    }
  }
  const bool found = records_.Load(type, record);
  if (found && &type == &UnsettledOrder::kType) ++ordersFoundUnsettled_;
  return found;
}

bool WatchedHost::Add(const RecordType& type, void* record) {
  if (!records_.Add(type, record)) return false;
  if (&type == &Log::kType) {
    const Log& log = *static_cast<const Log*>(record);
    logIds_.push_back(log.LogId);
    logs_.push_back(log);
  }
  return true;
}

}  // namespace partnerkit::cli
