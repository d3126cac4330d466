#include "host/sql_host.h"

#include <csignal>
#include <fstream>
#include <set>

#include "host/store_fixture.h"

namespace partnerkit::host {
namespace {

class SqlHostTest : public StoreTest {
 protected:
  template <class R>
  R Added(const std::function<void(R&)>& fill) {
    R record;
    fill(record);
    EXPECT_TRUE(host_->Records().Add(R::kType, &record)) << R::kType.kind;
    return record;
  }
  // An order with two lines, a location and three location lines.
  Order AddOrder(const std::string& number) {
    auto order = Added<Order>([&](Order& o) { o.PONo = number; });
    const auto of = [&](auto& record) { record.OrderId = order.OrderId; };
    Added<OrderLine>(of);
    Added<OrderLine>([&](OrderLine& line) { of(line), line.LineNo = "2"; });
    Added<OrderLocn>(of);
    for (int n = 0; n < 3; ++n) Added<OrderLocnLine>(of);
    return order;
  }
  void AddLog(const std::string& message) {
    Added<Log>([&](Log& log) { log.Message = message; });
  }
  std::string Rows() {
    return Ask(Path(),
               "SELECT (SELECT count(*) FROM tbOrder)||' '||(SELECT count(*) FROM tbOrderLine)||' '||"
               "(SELECT count(*) FROM tbOrderLocn)||' '||(SELECT count(*) FROM tbOrderLocnLine)");
  }
  void AddPartner(const std::string& id, std::int32_t last = 0) {
    Added<Partner>([&](Partner& partner) {
      partner.PartnerId = id;
      partner.LastASNNo = last;
      partner.LastInterchangeNo = 500;
    });
    host_->Commit(0);
  }

  std::unique_ptr<SqlHost> host_ = SqlHost::Open(Path(), {.lockTimeout = std::chrono::milliseconds(200)});
};

TEST_F(SqlHostTest, LeavesAnOrderWholeThatItCannotDelete) {
  const Order order = AddOrder("1");
  host_->Commit(0);
  Ask(Path(),
      "CREATE TRIGGER keep BEFORE DELETE ON tbOrderLine WHEN old.LineNo='2' BEGIN SELECT RAISE(FAIL,'kept'); END");
  AddLog("before it");
  EXPECT_FALSE(host_->DeleteOrder(order));
  // A rule that forbids it is a refusal; the store itself is well.
  EXPECT_EQ(host_->Records().NativeError(), 0);
  host_->Commit(0);
  EXPECT_EQ(Rows(), "1 2 1 3");
  EXPECT_EQ(Ask(Path(), "SELECT count(*) FROM tbLog"), "1");
  EXPECT_EQ(Ask(Path(), "BEGIN IMMEDIATE"), "no row");
  Ask(Path(), "DROP TRIGGER keep");
  EXPECT_TRUE(host_->DeleteOrder(order));
}

TEST_F(SqlHostTest, StoresANumberAtOnceWithWhatCameBeforeItAndSaysWhichIsUsedUp) {
  AddPartner("MGB", 2147483646);
  AddLog("waiting");
  EXPECT_EQ(host_->NextNumber("MGB", Counter::kASNNo), 2147483647);
  EXPECT_EQ(Ask(Path(), "SELECT LastASNNo||' '||(SELECT Message FROM tbLog) FROM tbPartner"), "2147483647 waiting");
  EXPECT_EQ(ErrorOf([&] { host_->NextNumber("MGB", Counter::kASNNo); }),
            "6 " + Path() + ": partner MGB has used up its LastASNNo");
  EXPECT_EQ(ErrorOf([&] { host_->NextNumber("XYZ", Counter::kGroupNo); }), Path() + ": there is no partner \"XYZ\"");
  host_->BeginTrans();
  EXPECT_EQ(host_->NextNumber("MGB", Counter::kGroupNo), 1);
  EXPECT_EQ(Ask(Path(), "SELECT LastGroupNo FROM tbPartner"), "0") << "within a transaction nobody else sees it";
  host_->CommitTrans();
  EXPECT_EQ(Ask(Path(), "SELECT LastGroupNo FROM tbPartner"), "1");
}

TEST_F(SqlHostTest, DoesNotLetAReplacedRecordTakeCountersBack) {
  AddPartner("MGB");
  Partner old;
  old.PartnerId = "MGB";
  ASSERT_TRUE(Load(host_->Records(), old));
  EXPECT_EQ(host_->NextNumber("MGB", Counter::kASNNo), 1);
  EXPECT_TRUE(host_->Records().ReplaceOrAdd(Partner::kType, &old));
  EXPECT_EQ(host_->NextNumber("MGB", Counter::kASNNo), 2);
}

TEST_F(SqlHostTest, GivesEachNumberOnceToManyProgramsEvenWhenOneIsKilled) {
  AddPartner("MGB");
  host_.reset();
  const auto draw = [&](int program) {
    const auto host = SqlHost::Open(Path());
    std::ofstream drawn(Path("drawn" + std::to_string(program)));
    for (int n = 0; n < 250; ++n) drawn << host->NextNumber("MGB", Counter::kInterchangeNo) << std::endl;
  };
  pid_t children[4];
  for (int n = 0; n < 4; ++n) children[n] = Fork([&] { draw(n); });
  const pid_t victim = Fork([&] {
    for (;;) draw(4);
  });
  while (!std::filesystem::exists(Path("drawn4")) || std::filesystem::file_size(Path("drawn4")) < 40) usleep(500);
  kill(victim, SIGKILL);
  EXPECT_EQ(Wait(victim), SIGKILL);
  for (const pid_t child : children) EXPECT_EQ(Wait(child), 0);
  std::set<int> numbers;
  int drawn = 0;
  for (int n = 0; n < 5; ++n) {
    std::ifstream file(Path("drawn" + std::to_string(n)));
    for (int number; file >> number; ++drawn) numbers.insert(number);
    if (n == 3) {
      EXPECT_EQ(drawn, 1000);
    }
  }
  EXPECT_EQ(numbers.size(), static_cast<std::size_t>(drawn));
  // At most the one number that the victim had drawn and not yet written down is missing.
  const int last = std::stoi(Ask(Path(), "SELECT LastInterchangeNo FROM tbPartner"));
  EXPECT_LE(last - 500 - drawn, 1);
}

TEST_F(SqlHostTest, KeepsSettings) {
  EXPECT_EQ(host_->Setting("CompanyName"), std::nullopt);
  host_->SetSetting("CompanyName", "Acme");
  host_->SetSetting("BatchControl", "");
  host_->SetSetting("CompanyName", "Acme Apparel");
  EXPECT_EQ(host_->Setting("BatchControl"), "");
  EXPECT_EQ(Ask(Path(), "SELECT count(*) FROM tbSystem"), "0");
  host_->Close();
  EXPECT_EQ(host_->Settings(),
            (std::vector<std::pair<std::string, std::string>>{{"BatchControl", ""}, {"CompanyName", "Acme Apparel"}}));
  const std::string login = host_->UserId();
  host_->BeginTrans();
  host_->SetSetting("UserId", "anna");
  EXPECT_EQ(host_->UserId(), "anna");
  host_->RollbackTrans();
  EXPECT_EQ(host_->UserId(), login);
}

TEST_F(SqlHostTest, RaisesWhatAReadMeetsInsteadOfFindingNothing) {
  const Order order = AddOrder("1");
  host_->Commit(0);
  Ask(Path(), "ALTER TABLE tbOrder RENAME TO gone");
  Order probe;
  probe.OrderId = order.OrderId;
  const std::string missing = Path() + ": no such table: tbOrder";
  auto& records = host_->Records();
  EXPECT_EQ(ErrorOf([&] { Load(records, probe); }), missing);
  EXPECT_EQ(records.NativeError(), 1);
  EXPECT_EQ(ErrorOf([&] { Find(records, Order::kByNumber, probe); }), missing);
  EXPECT_EQ(ErrorOf([&] { Select(records, Order::kByNumber, probe); }), missing);
  EXPECT_EQ(ErrorOf([&] { Count(records, Order::kByNumber, probe); }), missing);
  EXPECT_FALSE(Update(records, probe));
  Ask(Path(), "ALTER TABLE gone RENAME TO tbOrder");
  EXPECT_TRUE(Load(records, probe));
  EXPECT_EQ(records.NativeError(), 0);
  EXPECT_EQ(probe.PONo, "1");
}

}  // namespace
}  // namespace partnerkit::host
