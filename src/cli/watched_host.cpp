#include "cli/watched_host.h"

namespace partnerkit::cli {

bool WatchedHost::DeleteOrder(const Order& order) {
  if (!host_.DeleteOrder(order)) return false;
  ++ordersDeleted_;
  return true;
}

bool WatchedHost::Add(const RecordType& type, void* record) {
  if (!records_.Add(type, record)) return false;
  if (&type == &Log::kType) logIds_.push_back(static_cast<const Log*>(record)->LogId);
  return true;
}

}  // namespace partnerkit::cli
