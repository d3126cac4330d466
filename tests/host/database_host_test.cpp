#include "partnerkit/database_host.h"

#include "host/store_fixture.h"

namespace partnerkit::host {
namespace {

using DatabaseHostTest = StoreTest;

TEST_F(DatabaseHostTest, WaitsAndMakesTheDatabaseAsItsOptionsSay) {
  const auto withoutMaking = [&] { return DatabaseHost::Open(Path(), {.create = false}); };
  EXPECT_EQ(ErrorOf(withoutMaking), Path() + ": there is no such database");
  const auto first = DatabaseHost::Open("sqlite3://" + Path());
  const auto second = DatabaseHost::Open(Path(), {.lockTimeout = std::chrono::milliseconds(1)});
  first->BeginTrans();
  first->SetSetting("UserId", "kim");
  EXPECT_EQ(ErrorOf([&] { second->CheckWritable(); }), Path() + ": database is locked");
  first->CommitTrans();
  EXPECT_EQ(ErrorOf([&] { second->CheckWritable(); }), "");
  first->Close();
  EXPECT_EQ(withoutMaking()->Settings(), (std::vector<std::pair<std::string, std::string>>{{"UserId", "kim"}}));
}

}  // namespace
}  // namespace partnerkit::host
