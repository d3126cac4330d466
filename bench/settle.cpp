// How long `Term` takes to settle an order file, apart from the posting: the store of this program takes every order
// and keeps none.
//   settle all|one CLASS WORKSPACE FILE
// all: every order is posted, so that all lines go to the backup and the file ends empty.
// one: the first order is posted, so that all lines but its own are kept.
#include <cstdio>
#include <string_view>

#include "host/sql_host.h"
#include "partnerkit/catalogue.h"
#include "partnerkit/platform.h"
#include "stopwatch.h"

namespace {

using namespace partnerkit;

// Reads come from the workspace, orders and the like are only numbered.
class ForgetfulHost : public System, private RecordStore {
 public:
  explicit ForgetfulHost(host::SqlHost& host) : host_(host) {}

  RecordStore& Records() override { return *this; }
  std::string UserId() override { return host_.UserId(); }
  bool DeleteOrder(const Order&) override { return false; }
  void Commit(std::int32_t) override {}
  void BeginTrans() override {}
  void CommitTrans() override {}
  void RollbackTrans() override {}
  std::vector<EDIDoc> EDIDocList() override { return host_.EDIDocList(); }
  std::int32_t NextNumber(std::string_view, Counter) override { return ++lastId_; }

 private:
  bool Load(const RecordType& type, void* record) override { return host_.Records().Load(type, record); }
  bool Add(const RecordType& type, void* record) override {
    ++lastId_;
    if (&type == &Order::kType) static_cast<Order*>(record)->OrderId = lastId_;
    if (&type == &Log::kType) static_cast<Log*>(record)->LogId = lastId_;
    return true;
  }
  bool Update(const RecordType&, const void*) override { return true; }
  bool Delete(const RecordType&, const void*) override { return false; }
  bool Find(const RecordType& type, const Lookup& lookup, void* record) override {
    return &type != &Order::kType && host_.Records().Find(type, lookup, record);
  }
  void Select(const RecordType& type, const Lookup& lookup, const void* probe,
              const std::function<void*()>& next) override {
    host_.Records().Select(type, lookup, probe, next);
  }
  std::int32_t Count(const RecordType& type, const Lookup& lookup, const void* probe) override {
    return host_.Records().Count(type, lookup, probe);
  }
  std::int32_t NativeError() const override { return 0; }

  host::SqlHost& host_;
  std::int32_t lastId_ = 0;
};

int Settle(bool all, const std::string& progId, const std::string& workspace, const std::string& file) {
  const auto host = host::SqlHost::Open(workspace + "/partnerkit.db", {.relativePaths = true});
  ForgetfulHost system(*host);
  const auto importer = CreateTranslator(progId, platform::DefaultPorts());
  ColumnTable columns;
  RowTable rows;
  if (!importer->Init(system, 1, columns)) return 1;
  const std::int32_t count = importer->Load(file, rows);
  for (std::int32_t row = 0; row < (all ? count : 1); ++row) {
    ErrorList log;
    if (importer->Process(row, log) == 0) return 1;
  }
  const Stopwatch watch;
  if (!importer->Term()) return 1;
  std::printf("{\"orders\": %d, \"seconds\": %.6f, \"busy\": %.6f}\n", count, watch.Elapsed(), watch.Busy());
  return 0;
}

}  // namespace

int main(int count, char** arguments) {
  const std::string_view mode = count == 5 ? arguments[1] : "";
  if (mode != "all" && mode != "one") {
    std::fputs("usage: settle all|one CLASS WORKSPACE FILE\n", stderr);
    return 2;
  }
  const int status = Settle(mode == "all", arguments[2], arguments[3], arguments[4]);
  if (status != 0) std::fputs("settle: the file could not be listed, posted or settled\n", stderr);
  return status;
}
