#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/csv_orders.h"

namespace partnerkit::testing {
namespace {

using ::testing::IsEmpty;

// How a stored order looks before the file comes.
struct Before {
  std::string PONo = "450001";
  int jobs = 0;
  int status = 0;
  std::string type = "SA";
  std::string interchange = "999", group = "202";
};

// The number, status and interchange of each stored order: "450001/0 of 1001".
Texts StoredNow(CsvTrade& trade) {
  Texts all;
  for (const auto& order : trade.StoredOrderRecords()) {
    all.push_back(order->PONo + "/" + std::to_string(order->Status) + " of " + order->InterchangeCtl.value_or("null"));
  }
  return all;
}

// What becomes of the order's lines at `Term`.
enum class File { kLeaves, kStays };
using enum File;

const std::string kDuplicate = "W Process: ... Warning Duplicate PO 450001.";
const std::string kChange = "W Process: ... Warning Purchase Order Change Request 450001.";
const std::string kCancel = "W Process: ... Warning Purchase Order Cancel Request 450001.";
const std::string kHasJob = "R Process: Cannot process CANCELLATION.  Job exists already exists for PO 450001.";
const std::string kNoOriginal = "R Process: Cannot process CANCELLATION. Original PO 450001 doesn't exists.";
const Texts kOld = {"450001/0 of 999"}, kNew = {"450001/0 of 1001"}, kHalf = {"450001/9 of 999"};

struct StoredCase {
  std::string className, changed;
  std::optional<Before> before;
  Texts told;
  File file;
  Texts stored;
  bool refuses = false;   // to delete the stored order
  std::string options{};  // of reading
};

void Check(const StoredCase& c) {
  const Before before = c.before.value_or(Before{.jobs = -1});
  SCOPED_TRACE(c.className + " " + c.changed + ", jobs " + std::to_string(before.jobs) + ", status " +
               std::to_string(before.status) + ", type " + before.type + (c.refuses ? ", refused" : ""));
  Siblings trade(c.className);
  if (c.before) {
    trade.AddOrder(before.jobs, [&](Order& order) {
      order.PONo = before.PONo;
      order.TypeCode = before.type;
      order.InterchangeCtl = before.interchange;
      if (trade.className != kColes) order.GroupCtl = before.group;
      order.Status = before.status;
    });
  }
  if (c.refuses) trade.Refuse("DELETE", "tbOrder");
  trade.document.ReadOptions = c.options;
  trade.UseBackup();
  const std::string order = trade.Line(c.changed);
  const auto run = trade.Import(order);
  ASSERT_EQ(run.rows, 1);
  const bool posted = c.told.back().ends_with(" import completed.");
  EXPECT_EQ(run.outcomes[0].told, c.told);
  EXPECT_EQ(run.outcomes[0].result > 0, posted);
  Texts log = c.told;
  // Off the caller's error list.
  if (c.className == kTarget && c.before && before.interchange == "999") {
    log.insert(log.begin(), "W Process: Duplicate PO 450001 processed.");
  }
  EXPECT_EQ(run.log, log);
  EXPECT_EQ(StoredNow(trade), c.stored);
  EXPECT_EQ(trade.Orders(), c.file == kStays ? order : "");
  EXPECT_EQ(trade.Backup(), posted ? order : "");
  EXPECT_THAT(trade.reports, IsEmpty());
}

const Before kStored{};
const Before kPacked{.jobs = 1};
const Before kScrap{.status = 9};
const Before kScrapPacked{.jobs = 2, .status = 9};

TEST(CsvSiblingsStoredTest, SettlesAnOrderByItsRules) {
  const std::string blanketComma = "R Process: Cannot process Blanket Order, PO 450001";
  const std::string blanket = "R Process: Cannot process Blanket Order - PO 450001";
  const Before blanketStored{.type = "BL"}, blanketPacked{.jobs = 1, .type = "BL"};
  const std::string release = "POTYPECODE=RL", release2 = "POTYPECODE=RL; POVERSIONNO=2";
  const std::string balance = "W Process: ... Warning Purchase Order Change Request Cancel Balance Of 450001.";
  const std::string changePacking = "W Process: ... Warning Purchase Order Change Request. Packing in Process. 450001.";
  const std::string balancePacking =
      "W Process: ... Warning Purchase Order Change Request Cancel Balance. Packing in Process. 450001.";
  const std::string cancelPacking = "W Process: ... Warning Purchase Order Cancel Request. Packing in Process. 450001.";
  const std::string direct = "R Process: Cannot process DTS Order - PO 450001";
  const std::string change = "POPURPOSECODE=4", version = change + "; POVERSIONNO=2";
  const std::string toStore = "SHIPTOLOCPARTNERNO=0512", accept = "#%X #%ACCEPTOFFICEWORKSDTSORDERS";
  const StoredCase cases[] = {
      // clang-format off
      {kMgb,  "POPURPOSECODE=07", kStored, {kDuplicate, kCompleted}, kLeaves, kNew},
      {kMgb,  "POPURPOSECODE=07", kScrap,  {kDuplicate, kCompleted}, kLeaves, kNew},
      {kMgb,  "POPURPOSECODE=07", kPacked, {kExists},                kLeaves, kOld},
      {kMgb,  "POPURPOSECODE=05", kStored, {kChange, kCompleted},    kLeaves, kNew},
      {kMgb,  "POPURPOSECODE=05", kStored, {kChange},                kStays,  kOld, true},
      {kMgb,  "POPURPOSECODE=05", kScrapPacked, {kScrapped, kCompleted}, kLeaves, kNew},
      {kMgb,  "POPURPOSECODE=01", kStored, {kCancel},                kLeaves, {}},
      {kMgb,  "POPURPOSECODE=1",  kStored, {kCancel},                kLeaves, {}},
      {kMgb,  "POPURPOSECODE=01", kStored, {kCancel},                kLeaves, kOld, true},
      {kMgb,  "POPURPOSECODE=01", kPacked, {kHasJob},                kLeaves, kOld},
      {kMgb,  "POPURPOSECODE=1",  kScrapPacked, {kHasJob},           kLeaves, kHalf},
      {kMgb,  "",                 kScrap,  {kScrapped, kCompleted},  kLeaves, kNew},
      {kMgb,  "",                 kScrap,  {kScrapped},              kStays,  kHalf, true},
      {kMgb,  "",                 kStored, {kExists},                kLeaves, kOld},
      {kMgb,  "POPURPOSECODE=",   Before{.status = 1}, {kExists},    kLeaves, {"450001/1 of 999"}},
      {kMgb,  "POPURPOSECODE=01", {},      {kNoOriginal},            kLeaves, {}},
      {kMgb,  "POPURPOSECODE=1",  {},      {kNoOriginal},            kLeaves, {}},
      {kMgb,  "POPURPOSECODE=01 1", {},    {kCompleted},             kLeaves, kNew},

      {kMyer, "POPURPOSECODE=1",  kStored, {kCancel},                kLeaves, {}},

      {kGhpl, "POPURPOSECODE=07", kStored, {kDuplicate, kCompleted}, kLeaves, kNew},
      {kGhpl, "POPURPOSECODE=07", kPacked, {kExists},                kLeaves, kOld},
      {kGhpl, "POPURPOSECODE=07", kScrapPacked, {kScrapped, kCompleted}, kLeaves, kNew},
      {kGhpl, "POPURPOSECODE=05", kStored, {kExists},                kLeaves, kOld},
      {kGhpl, "POPURPOSECODE=01", kStored, {kExists},                kLeaves, kOld},
      {kGhpl, "POPURPOSECODE=01", {},      {kCompleted},             kLeaves, kNew},

      {kTarget, "POPURPOSECODE=07", kStored, {kDuplicate, kCompleted}, kLeaves, kNew},
      {kTarget, "POPURPOSECODE=07", kPacked, {kExists},              kLeaves, kOld},
      {kTarget, release,      blanketStored, {kDuplicate, kCompleted}, kLeaves, kNew},
      {kTarget, release,      blanketPacked, {kExists},              kLeaves, kOld},
      {kTarget, release,            kStored, {kExists},              kLeaves, kOld},
      {kTarget, "",           blanketStored, {kExists},              kLeaves, kOld},
      {kTarget, "",                 kScrap,  {kScrapped, kCompleted}, kLeaves, kNew},
      // The stored order has gone before the blanket order is refused.
      {kTarget, "POPURPOSECODE=07; POTYPECODE=BL", kStored, {kDuplicate, blanketComma}, kLeaves, {"450001/0 of 999"}},
      {kTarget, "POTYPECODE=BL",    {},      {blanketComma},         kLeaves, {}},
      {kTarget, "POPURPOSECODE=01; POTYPECODE=RL", {}, {kCompleted}, kLeaves, kNew},

      {kKmart, "POPURPOSECODE=07", kStored, {kDuplicate, kCompleted}, kLeaves, kNew},
      {kKmart, "POPURPOSECODE=05", kStored, {kChange, kCompleted},   kLeaves, kNew},
      {kKmart, "POPURPOSECODE=05", kPacked, {kExists},               kLeaves, kOld},
      {kKmart, "POPURPOSECODE=01", kStored, {kCancel},               kStays,  {}},
      {kKmart, "POPURPOSECODE=01", kStored, {kCancel},               kStays,  kOld, true},
      {kKmart, "POPURPOSECODE=01", kPacked, {kExists},               kLeaves, kOld},
      {kKmart, "POPURPOSECODE=1",  kStored, {kExists},               kLeaves, kOld},
      {kKmart, "",                 kScrap,  {kScrapped, kCompleted}, kLeaves, kNew},
      {kKmart, "POPURPOSECODE=01", {},      {kCancel},               kStays,  {}},
      {kKmart, "POPURPOSECODE=1",  {},      {kCompleted},            kLeaves, kNew},
      {kKmart, "POTYPECODE=BK",    {},      {blanket},               kLeaves, {}},
      // A release is stored, looked for and told of under its own number.
      {kKmart, release2, kStored, {"0 Process: PO 450001 REL# 2 import completed."}, kLeaves,
       {"450001/0 of 999", "450001 REL# 2/0 of 1001"}},
      {kKmart, release2, Before{.PONo = "450001 REL# 2"},
       {"R Process: Cannot process. PO 450001 REL# 2 already exists."}, kLeaves, {"450001 REL# 2/0 of 999"}},

      {kOfficeworks, "",                 kScrap,  {kScrapped, kCompleted}, kLeaves, kNew},
      {kOfficeworks, "POPURPOSECODE=1",  kScrap,  {kScrapped, kCancel}, kLeaves, {}},
      {kOfficeworks, change,             kStored, {kChange, kCompleted}, kLeaves, kNew},
      {kOfficeworks, version,            kStored, {balance, balance},  kLeaves, {}},
      {kOfficeworks, version,            kStored, {balance},           kStays,  kOld, true},
      {kOfficeworks, "POPURPOSECODE=1",  kStored, {kCancel},           kLeaves, {}},
      {kOfficeworks, change,             kPacked, {changePacking},     kLeaves, kOld},
      {kOfficeworks, version,            kPacked, {balancePacking},    kLeaves, kOld},
      {kOfficeworks, "POPURPOSECODE=1",  kPacked, {cancelPacking},     kLeaves, kOld},
      {kOfficeworks, "POPURPOSECODE=01", kPacked, {kExists},           kLeaves, kOld},
      {kOfficeworks, change,             {},      {kCompleted},        kLeaves, kNew},
      {kOfficeworks, version,            {},      {balance},           kLeaves, {}},
      {kOfficeworks, "POPURPOSECODE=1",  {},      {kCancel},           kLeaves, {}},
      {kOfficeworks, "POTYPECODE=BK",    {},      {blanket},           kLeaves, {}},
      {kOfficeworks, toStore,            {},      {direct},            kLeaves, {}},
      {kOfficeworks, toStore,            {},      {kCompleted},        kLeaves, kNew, false, accept},
      {kOfficeworks, toStore,            {},      {direct},            kLeaves, {}, false, "#%ACCEPTDTSORDERS"},
      // clang-format on
  };
  for (const auto& c : cases) Check(c);
}

TEST(CsvSiblingsStoredTest, SettlesAnOrderThatIsAnsweredByItsRules) {
  const std::string change = "W Process: ... Warning Purchase Order Change 450001.";
  const std::string allocated = "R Process: Cannot process change. Job for PO 450001 already allocated.";
  const std::string deleted = "W Process: ... Warning Purchase Order Response. 450001 deleted.";
  const std::string noOriginal = "R Process: Cannot process. Original PO 450001 for rejection doesn't exists.";
  const std::string order = "TRADEDQUANTITY=48; POTYPECODE=220";
  const std::string changed = "TRADEDQUANTITY=48; STATUS=3; POTYPECODE=231",
                    rejected = changed + "; RESPONSETYPECODE=27";
  const StoredCase cases[] = {
      // clang-format off
      // What is turned away stays in the file.
      {kBulk, order,    kStored, {kExists},            kStays,  kOld},
      {kBulk, order,    kScrap,  {kExists},            kStays,  kHalf},
      {kBulk, rejected, kStored, {deleted},            kStays,  {}},
      {kBulk, rejected, kStored, {deleted},            kStays,  kOld, true},
      {kBulk, changed,  kStored, {change, kCompleted}, kLeaves, kNew},
      {kBulk, changed,  kPacked, {allocated},          kStays,  kOld},
      {kBulk, rejected, kPacked, {allocated},          kStays,  kOld},
      {kBulk, rejected, {},      {noOriginal},         kStays,  {}},
      {kBulk, changed,  {},      {kCompleted},         kLeaves, kNew},

      // CML's short numbers go by their ship-to; only the rejection of nothing shows what the file has.
      {kCml, order, kStored, {"0 Process: PO 450001 #0900 import completed."}, kLeaves,
       {"450001/0 of 999", "450001 #0900/0 of 1001"}},
      {kCml, rejected, kStored, {noOriginal}, kStays, kOld},
      {kCml, order, Before{.PONo = "450001 #0900"}, {"R Process: Cannot process. PO 450001 #0900 already exists."},
       kStays, {"450001 #0900/0 of 999"}},

      {kColes, "",                 kStored, {change, kCompleted},  kLeaves, kNew},
      {kColes, "POPURPOSECODE=07", kScrap,  {change, kCompleted},  kLeaves, kNew},
      {kColes, "",                 kPacked, {allocated},           kLeaves, kOld},
      {kColes, "POPURPOSECODE=01", kStored, {change, kNoOriginal}, kLeaves, {}},
      // clang-format on
  };
  for (const auto& c : cases) Check(c);
}

TEST(CsvSiblingsStoredTest, MgbbtSettlesAStoredOrder) {
  // The same words from its merchandise orders.
  const auto merch = [](std::string told) { return told.replace(2, 7, "MerchPOProcess"); };
  const std::string completed = merch(kCompleted), exists = merch(kExists), cancel = merch(kCancel);
  const std::string cancelled = "W Process: ... Warning Purchase Order CANCEL Request 450001 processed.";
  const std::string failed = "W Process: ... Warning Purchase Order Cancel Request FAILED450001.";
  const std::string change = "W Process: ... Warning Purchase Order Change Request 450001processed.";
  const std::string zone = "; STOREZONE=", customer = "POTYPECODE=230", cancels = customer + "; POPURPOSECODE=1";
  const StoredCase cases[] = {
      // clang-format off
      {kMgbbt, "POPURPOSECODE=07" + zone, kStored, {merch(kDuplicate), completed}, kLeaves, kNew},
      {kMgbbt, "POPURPOSECODE=05" + zone, kStored, {merch(kChange), completed}, kLeaves, kNew},
      {kMgbbt, "POPURPOSECODE=01" + zone, kStored, {cancel},                    kStays,  {}},
      {kMgbbt, "POPURPOSECODE=01" + zone, kPacked, {merch(kHasJob)},            kLeaves, kOld},
      {kMgbbt, "POPURPOSECODE=07" + zone, kPacked, {exists},                    kLeaves, kOld},
      {kMgbbt, "POPURPOSECODE=00" + zone, kScrap,  {merch(kScrapped), completed}, kLeaves, kNew},
      {kMgbbt, cancels + zone,            kStored, {exists},                    kLeaves, kOld},
      // A cancellation must not be posted as what it cancels.
      {kMgbbt, "POPURPOSECODE=01" + zone, {},      {cancel},                    kStays,  {}},

      {kMgbbt, cancels,                   kStored, {cancelled},                 kLeaves, {}},
      {kMgbbt, cancels,                   kStored, {cancelled, failed},         kStays,  kOld, true},
      {kMgbbt, cancels,                   kPacked, {kExists},                   kLeaves, kOld},
      {kMgbbt, customer + "; POPURPOSECODE=01", kStored, {change, kCompleted},  kLeaves, kNew},
      {kMgbbt, customer,             kScrapPacked, {kScrapped, kCompleted},     kLeaves, kNew},
      {kMgbbt, "POPURPOSECODE=1",         kStored, {kExists},                   kLeaves, kOld},
      {kMgbbt, "POPURPOSECODE=1",         {},      {kCompleted},                kLeaves, kNew},
      {kMgbbt, "INCOMINGPRODUCTNO=; ORDERQUANTITY=0", {},
       {"R Process: ... Warning Purchase Order Change Request 450001. Order cancelled."}, kLeaves, {}},
      // clang-format on
  };
  for (const auto& c : cases) Check(c);
}

// The same transaction again, whatever it says; one that an earlier run left half stored is taken up again, but for
// Kmart's, whose orders with errors stay at that status. The control numbers count as joined.
TEST(CsvSiblingsStoredTest, TakesTheSameTransactionOnce) {
  const Before complete{.interchange = "100", .group = "1202"}, half{.status = 9, .interchange = "1001"};
  for (const std::string className : {kMgb, kMyer, kGhpl, kTarget, kMgbbt, kKmart, kOfficeworks}) {
    Check({className, "POPURPOSECODE=05", complete, {kExists}, kLeaves, {"450001/0 of 100"}});
    Check({className, "POPURPOSECODE=05", half, {kScrapped, kCompleted}, kLeaves, kNew});
  }
  // A long number, that CML's orders go by it, too.
  const std::string changed = "POTYPECODE=231; STATUS=5; TRADEDQUANTITY=48; PONUMBER=450001000";
  const auto told = [](const std::string& text) { return Replaced(text, "450001", "450001000"); };
  for (const std::string className : {kCml, kBulk, kColes}) {
    Before same{.PONo = "450001000", .interchange = "1001"};
    Check({className, changed, same, {told(kExists)}, className == kColes ? kLeaves : kStays, {"450001000/0 of 1001"}});
    same.status = 9;
    Check({className, changed, same, {told(kScrapped), told(kCompleted)}, kLeaves, {"450001000/0 of 1001"}});
  }
}

}  // namespace
}  // namespace partnerkit::testing
