// What every host answers: the bundled one, one in memory, and one that has nothing but a record store. Which packs
// wait for a notice is in tests/host/packs_to_compile_test.cpp.
#include <functional>

#include "host/sql_session.h"
#include "partnerkit/memory_host.h"
#include "support/error_of.h"
#include "support/record_host.h"
#include "support/trading_fixture.h"

namespace partnerkit::testing {
namespace {

struct Bundled {
  TempFolder folder;
  std::unique_ptr<host::SqlHost> opened = host::SqlHost::Open(folder / "store.db");
  System& system = *opened;
};
struct InMemory {
  MemoryHost system;
};
struct OnARecordStore {
  Bundled below;
  RecordHost system{*below.opened};
};

template <class Kept>
class HostTest : public ::testing::Test {
 protected:
  template <class R>
  R Added(const std::function<void(R&)>& fill) {
    R record;
    fill(record);
    EXPECT_TRUE(Add(host_.Records(), record)) << R::kType.kind;
    return record;
  }
  template <class R>
  std::int32_t All() {
    return Count(host_.Records(), kEveryRecord, R());
  }
  // An order with two lines, a location and three location lines.
  Order AddOrder(const std::string& number) {
    auto order = Added<Order>([&](Order& o) { o.PONo = number; });
    const auto of = [&](auto& record) { record.OrderId = order.OrderId; };
    for (int n = 0; n < 2; ++n) Added<OrderLine>(of);
    Added<OrderLocn>(of);
    for (int n = 0; n < 3; ++n) Added<OrderLocnLine>(of);
    return order;
  }
  std::string Counts() {
    std::string counts;
    for (const std::int32_t count : {All<Order>(), All<OrderLine>(), All<OrderLocn>(), All<OrderLocnLine>()}) {
      counts += std::to_string(count) + " ";
    }
    return counts;
  }
  void AddPartner(const std::string& id, std::int32_t last = 0) {
    Added<Partner>([&](Partner& partner) {
      partner.PartnerId = id;
      partner.LastASNNo = last;
      partner.LastInterchangeNo = 500;
    });
    host_.Commit(0);
  }
  std::int32_t LastASNNo(const std::string& id) {
    Partner partner;
    partner.PartnerId = id;
    EXPECT_TRUE(Load(host_.Records(), partner));
    return partner.LastASNNo;
  }
  // The number of the error that drawing a number raises.
  std::string Refused(const std::string& id) {
    const std::string error = ErrorOf([&] { host_.NextNumber(id, Counter::kASNNo); });
    return error.substr(0, error.find(' '));
  }

  Kept kept_;
  System& host_ = kept_.system;
};

using Hosts = ::testing::Types<Bundled, InMemory, OnARecordStore>;
TYPED_TEST_SUITE(HostTest, Hosts);

TYPED_TEST(HostTest, DeletesAnOrderWithAllThatBelongsToIt) {
  const Order first = this->AddOrder("1"), second = this->AddOrder("2");
  this->template Added<Job>([&](Job& job) { job.OrderId = first.OrderId; });
  EXPECT_TRUE(this->host_.DeleteOrder(first));
  this->host_.Commit(0);
  EXPECT_EQ(this->Counts(), "1 2 1 3 ");
  OrderLocnLine ofSecond;
  ofSecond.OrderId = second.OrderId;
  EXPECT_EQ(Count(this->host_.Records(), OrderLocnLine::kByOrder, ofSecond), 3);
  EXPECT_EQ(this->template All<Job>(), 1);
  EXPECT_FALSE(this->host_.DeleteOrder(first));
  this->host_.BeginTrans();
  EXPECT_TRUE(this->host_.DeleteOrder(second));
  EXPECT_EQ(this->Counts(), "0 0 0 0 ");
  this->host_.RollbackTrans();
  EXPECT_EQ(this->Counts(), "1 2 1 3 ");
}

TYPED_TEST(HostTest, CountsEachNumberOfEachPartnerByItself) {
  this->AddPartner("MGB", 41);
  this->AddPartner("KMT");
  EXPECT_EQ(this->host_.NextNumber("MGB", Counter::kASNNo), 42);
  EXPECT_EQ(this->host_.NextNumber("MGB", Counter::kASNNo), 43);
  EXPECT_EQ(this->host_.NextNumber("MGB", Counter::kInterchangeNo), 501);
  EXPECT_EQ(this->host_.NextNumber("MGB", Counter::kGroupNo), 1);
  EXPECT_EQ(this->host_.NextNumber("KMT", Counter::kASNNo), 1);
  EXPECT_EQ(this->LastASNNo("MGB"), 43);
}

TYPED_TEST(HostTest, GivesNoNumberThatCouldComeAgain) {
  this->AddPartner("MGB", 2147483646);
  EXPECT_EQ(this->host_.NextNumber("MGB", Counter::kASNNo), 2147483647);
  EXPECT_EQ(this->Refused("MGB"), "6");
  EXPECT_EQ(this->Refused("MGB"), "6");
  EXPECT_EQ(this->Refused("XYZ"), "40002");
}

TYPED_TEST(HostTest, TakesANumberBackWithTheTransactionItWasGivenIn) {
  this->AddPartner("MGB", 41);
  this->host_.BeginTrans();
  EXPECT_EQ(this->host_.NextNumber("MGB", Counter::kASNNo), 42);
  EXPECT_EQ(this->Refused("XYZ"), "40002");
  EXPECT_EQ(this->host_.NextNumber("MGB", Counter::kASNNo), 43);
  this->host_.RollbackTrans();
  EXPECT_EQ(this->LastASNNo("MGB"), 41);
  this->host_.BeginTrans();
  EXPECT_EQ(this->host_.NextNumber("MGB", Counter::kASNNo), 42);
  this->host_.CommitTrans();
  this->host_.RollbackTrans();
  EXPECT_EQ(this->LastASNNo("MGB"), 42);
}

TYPED_TEST(HostTest, DoesNotLetAnOldRecordTakeCountersBack) {
  this->AddPartner("MGB");
  Partner old;
  old.PartnerId = "MGB";
  ASSERT_TRUE(Load(this->host_.Records(), old));
  EXPECT_EQ(this->host_.NextNumber("MGB", Counter::kASNNo), 1);
  old.Name = "MGB Stores";
  EXPECT_TRUE(Update(this->host_.Records(), old));
  EXPECT_EQ(this->host_.NextNumber("MGB", Counter::kASNNo), 2);
  old.LastASNNo = 700;
  EXPECT_TRUE(Update(this->host_.Records(), old));
  EXPECT_EQ(this->host_.NextNumber("MGB", Counter::kASNNo), 701);
}

TYPED_TEST(HostTest, TakesBackEveryKindOfChangeOfATransaction) {
  RecordStore& store = this->host_.Records();
  const Order kept = this->AddOrder("kept"), changed = this->AddOrder("changed");
  this->host_.BeginTrans();
  Order changing = changed;
  changing.PONo = "other";
  EXPECT_TRUE(Update(store, changing));
  changing.PONo = "another";
  EXPECT_TRUE(Update(store, changing));
  EXPECT_TRUE(Delete(store, kept));
  this->AddOrder("added");
  this->host_.RollbackTrans();
  std::string numbers;
  for (const auto& order : Select(store, kEveryRecord, Order())) numbers += order->PONo + " ";
  EXPECT_EQ(numbers, "kept changed ");
  EXPECT_EQ(this->Counts(), "2 4 2 6 ");
  Order probe;
  probe.PONo = "changed";
  EXPECT_TRUE(Find(store, Order::kByNumber, probe));
  probe.PONo = "another";
  EXPECT_FALSE(Find(store, Order::kByNumber, probe));
}

TYPED_TEST(HostTest, KnowsATransactionFromNone) {
  EXPECT_NE(ErrorOf([&] { this->host_.CommitTrans(); }), "");
  this->host_.RollbackTrans();
  this->host_.BeginTrans();
  EXPECT_NE(ErrorOf([&] { this->host_.BeginTrans(); }), "");
  this->AddOrder("1");
  this->host_.CommitTrans();
  EXPECT_EQ(this->Counts(), "1 2 1 3 ");
}

TYPED_TEST(HostTest, ListsDocumentsByTheirId) {
  for (const std::int32_t id : {20, 3, 11}) {
    this->template Added<EDIDoc>([&](EDIDoc& doc) { doc.EDIDocId = id; });
  }
  std::vector<std::int32_t> ids;
  for (const EDIDoc& doc : this->host_.EDIDocList()) ids.push_back(doc.EDIDocId);
  EXPECT_EQ(ids, (std::vector<std::int32_t>{3, 11, 20}));
}

TYPED_TEST(HostTest, TellsKeysOfSeveralTextsApart) {
  const auto place = [&](const char* vendor, const char* number) {
    PartnerLocn locn;
    locn.VendorId = vendor;
    locn.PartnerLocnNo = number;
    return locn;
  };
  PartnerLocn stored = place("ACME", "0052"), other = place("ACME0", "052");
  EXPECT_TRUE(Add(this->host_.Records(), stored));
  EXPECT_FALSE(Load(this->host_.Records(), other));
}

TEST(MemoryHostTest, KeepsSettingsAndTakesThemBackWithTheTransaction) {
  MemoryHost host;
  EXPECT_EQ(host.UserId(), "");
  EXPECT_EQ(host.Setting("PrinterLanguage"), std::nullopt);
  host.SetSetting("UserId", "anna");
  host.SetSetting("PrinterLanguage", "");
  host.BeginTrans();
  host.SetSetting("UserId", "kim");
  EXPECT_EQ(host.UserId(), "kim");
  host.RollbackTrans();
  EXPECT_EQ(host.UserId(), "anna");
  EXPECT_EQ(host.Setting("PrinterLanguage"), "");
}

TEST(MemoryHostTest, TellsWhyItRefuses) {
  MemoryHost host;
  Log log;
  log.LogId = 2147483647;
  EXPECT_TRUE(Add(host.Records(), log));
  EXPECT_FALSE(Add(host.Records(), log));
  EXPECT_EQ(host.Records().NativeError(), MemoryStore::kDuplicate);
  Log next;
  EXPECT_FALSE(Add(host.Records(), next));
  EXPECT_EQ(host.Records().NativeError(), MemoryStore::kNoId);
  constexpr std::string_view kUnknown[] = {"Colour"};
  EXPECT_EQ(ErrorOf([&] { Find(host.Records(), Lookup{"ByColour", kUnknown}, next); }), "51 Log has no member Colour");
  EXPECT_EQ(host.Records().NativeError(), 0);
}

TEST(MemoryHostTest, WalksAroundWhatChangesMeanwhileAndGivesNoIdTwice) {
  MemoryHost host;
  Order first, second, third, late;
  first.PONo = "1", second.PONo = "2", third.PONo = "3";
  host.BeginTrans();
  EXPECT_TRUE(Add(host.Records(), late));
  host.RollbackTrans();
  EXPECT_TRUE(Add(host.Records(), first) && Add(host.Records(), second) && Add(host.Records(), third));
  std::vector<Order> seen;
  seen.reserve(4);
  host.Records().Select(Order::kType, kEveryRecord, &first, [&]() -> void* {
    if (seen.empty()) {
      late.OrderId = 0;
      EXPECT_TRUE(Delete(host.Records(), second) && Add(host.Records(), late));
    }
    return &seen.emplace_back();
  });
  std::string ids;
  for (const Order& order : seen) ids += std::to_string(order.OrderId) + " ";
  EXPECT_EQ(ids, "2 4 ");
  EXPECT_EQ(late.OrderId, 5);
}

// An order that its store gives up in part only.
TEST(StoreHostTest, LeavesAnOrderWholeThatItCannotDelete) {
  Bundled bundled;
  RecordHost host(*bundled.opened);
  Order order;
  OrderLine line, kept;
  ASSERT_TRUE(Add(host.Records(), order));
  line.OrderId = kept.OrderId = order.OrderId;
  kept.LineNo = "2";
  ASSERT_TRUE(Add(host.Records(), line) && Add(host.Records(), kept));
  bundled.opened->Session().Execute(
      "CREATE TRIGGER keep BEFORE DELETE ON tbOrderLine WHEN old.LineNo='2' BEGIN SELECT RAISE(FAIL,'kept'); END");
  EXPECT_FALSE(host.DeleteOrder(order));
  EXPECT_EQ(Count(host.Records(), OrderLine::kByOrder, line), 2);
  EXPECT_TRUE(Load(host.Records(), order));
  host.BeginTrans();
  EXPECT_FALSE(host.DeleteOrder(order));
  host.RollbackTrans();
  EXPECT_EQ(Count(host.Records(), OrderLine::kByOrder, line), 2);
}

}  // namespace
}  // namespace partnerkit::testing
