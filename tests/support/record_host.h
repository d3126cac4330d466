// A host of the fewest overrides: the answers of StoreHost over the records of the bundled host.
#pragma once

#include "host/sql_host.h"
#include "partnerkit/store_host.h"

namespace partnerkit::testing {

class RecordHost : public StoreHost {
 public:
  explicit RecordHost(host::SqlHost& below) : below_(below) {}
  RecordStore& Records() override { return below_.Records(); }

 protected:
  void OpenTransaction() override { below_.BeginTrans(); }
  void CloseTransaction(bool keep) override { keep ? below_.CommitTrans() : below_.RollbackTrans(); }

 private:
  host::SqlHost& below_;
};

}  // namespace partnerkit::testing
