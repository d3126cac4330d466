// What every record store keeps to: the bundled host's in SQL, and the one in memory.
#include <limits>
#include <tuple>
#include <vector>

#include "host/schema.h"
#include "host/sql_session.h"
#include "host/sql_store.h"
#include "host/store_fixture.h"
#include "partnerkit/memory_host.h"

namespace partnerkit::testing {
namespace {

using host::Keyed;
using host::Sample;

struct InSql {
  InSql() { host::PrepareSchema(session, host::kTestTypes); }
  TempFolder folder;
  host::SqlSession session{folder / "store.db", {}};
  host::SqlStore store{session};
};
struct InMemory {
  MemoryStore store;
};

template <class Kept>
class RecordStoreTest : public ::testing::Test, protected host::SampleRecords {
 protected:
  RecordStore& Samples() override { return store_; }

  std::string OfNote(Text note) {
    std::string codes;
    for (const auto& sample : Select(store_, Sample::kByNote, Sample{.Note = std::move(note)})) {
      codes += sample->Code + " ";
    }
    return codes;
  }
  std::string OfOwner(const std::string& owner) {
    std::string all;
    for (const auto& keyed : Select(store_, Keyed::kByOwner, Keyed{owner, 0, {}})) {
      all += keyed->OwnerId + std::to_string(keyed->Position) + std::string(Str(keyed->Value)) + " ";
    }
    return all;
  }

  Kept kept_;
  RecordStore& store_ = kept_.store;
};

using Stores = ::testing::Types<InSql, InMemory>;
TYPED_TEST_SUITE(RecordStoreTest, Stores);

auto Values(const Sample& s) { return std::tuple(s.Code, s.Note, s.Whole, s.Long, s.Flag, s.Real, s.Number, s.Date); }

TYPED_TEST(RecordStoreTest, GivesBackEveryKindOfMemberAsItWasStored) {
  using Limit = std::numeric_limits<double>;
  const Sample samples[] = {
      {0, "", Text(), 0, 0, false, 0, std::nullopt, std::nullopt},
      {0, "empty note", Text(""), -1, -1, true, 0.1 + 0.2, 0.0, DateTime::FromYmd(2004, 7, 31)},
      {0, std::string("nul\0inside", 10), Text(std::string("\0\xff\xc3(\r\n'\"", 8)), 2147483647, 9223372036854775807,
       true, 1e308, 99999999999.0, DateTime::FromYmdHms(1, 1, 1, 0, 0, 1)},
      {0, std::string("nul\0outside", 11), Text(std::string(300000, 'x')), -2147483647 - 1,
       std::int64_t{-9007199254740993}, false, -5e-324, Limit::max(), DateTime::FromYmdHms(9999, 12, 31, 23, 59, 59)},
      {0, "infinite", Text(), 5, 6, true, Limit::infinity(), -Limit::infinity(), std::nullopt},
  };
  for (const Sample& sample : samples) {
    EXPECT_EQ(Values(this->Stored(this->Added(sample))), Values(sample)) << sample.Code;
    Sample found{.Code = sample.Code};
    ASSERT_TRUE(Find(this->store_, Sample::kByCode, found));
    EXPECT_EQ(Values(found), Values(sample)) << sample.Code;
  }
  const Sample notANumber{.Code = "number", .Number = Limit::quiet_NaN()};
  EXPECT_EQ(this->Stored(this->Added(notANumber)).Number, std::nullopt);
}

TYPED_TEST(RecordStoreTest, GivesTheNextIdToARecordWithoutOne) {
  EXPECT_EQ(this->Added({.Code = "a"}), 1);
  EXPECT_EQ(this->Added({.SampleId = 70, .Code = "b"}), 70);
  EXPECT_EQ(this->Added({.Code = "c"}), 71);
  EXPECT_TRUE(Delete(this->store_, Sample{.SampleId = 71}));
  EXPECT_EQ(this->Added({.Code = "d"}), 72) << "what still names record 71 must not find another in its place";
  EXPECT_EQ(this->Added({.SampleId = 2147483647, .Code = "last"}), 2147483647);
  Sample beyond{.Code = "beyond"}, below{.SampleId = -1, .Code = "below"}, taken{.SampleId = 70, .Code = "taken"};
  EXPECT_FALSE(Add(this->store_, beyond));
  EXPECT_EQ(beyond.SampleId, 0);
  EXPECT_FALSE(Add(this->store_, below));
  EXPECT_FALSE(Add(this->store_, taken));
  EXPECT_EQ(this->Stored(70).Code, "b");
}

TYPED_TEST(RecordStoreTest, WritesByIdOrByKeyAndNothingThatItDoesNotFind) {
  RecordStore& store = this->store_;
  const std::int32_t id = this->Added({.Code = "before", .Note = "n", .Whole = 1});
  const std::int32_t other = this->Added({.Code = "other", .Whole = 2});
  EXPECT_TRUE(Update(store, Sample{.SampleId = id, .Code = "after", .Whole = 3}));
  EXPECT_EQ(this->Stored(id).Code, "after");
  EXPECT_EQ(this->Stored(id).Note, std::nullopt);
  EXPECT_EQ(this->Stored(other).Whole, 2);
  this->AddKeyed("A", 1, "one");
  this->AddKeyed("A", 2, "two");
  EXPECT_TRUE(Update(store, Keyed{"A", 2, "deux"}));
  EXPECT_TRUE(Delete(store, Keyed{"A", 1, {}}));
  EXPECT_EQ(this->OfOwner("A"), "A2deux ");

  Sample mine{.SampleId = 9, .Code = "mine", .Note = "kept"};
  EXPECT_FALSE(Load(store, mine) || Find(store, Sample::kByCode, mine));
  EXPECT_EQ(mine.Note, "kept");
  EXPECT_FALSE(Update(store, mine) || Delete(store, mine));
  EXPECT_EQ(store.NativeError(), 0);
}

TYPED_TEST(RecordStoreTest, RefusesASecondRecordOfAUniqueLookupOrKey) {
  RecordStore& store = this->store_;
  const std::int32_t first = this->Added({.Code = "one"});
  Sample twin{.Code = "one", .Note = "twin"};
  EXPECT_FALSE(Add(store, twin));
  EXPECT_NE(store.NativeError(), 0);
  const std::int32_t second = this->Added({.Code = "two"});
  EXPECT_EQ(store.NativeError(), 0);
  EXPECT_FALSE(Update(store, Sample{.SampleId = second, .Code = "one"}));
  EXPECT_NE(store.NativeError(), 0);
  EXPECT_EQ(this->Stored(second).Code, "two");
  EXPECT_TRUE(Update(store, Sample{.SampleId = first, .Code = "one", .Note = "its own"}));
  this->AddKeyed("A", 1, "first");
  Keyed keyed{"A", 1, "second"};
  EXPECT_FALSE(Add(store, keyed));
  Sample notANumber{.Code = "nan", .Real = std::numeric_limits<double>::quiet_NaN()};
  EXPECT_FALSE(Add(store, notANumber));
  EXPECT_FALSE(Update(store, Sample{.SampleId = first, .Real = std::numeric_limits<double>::quiet_NaN()}));
  EXPECT_EQ(this->OfNote("its own"), "one ");
}

TYPED_TEST(RecordStoreTest, SelectsInTheOrderAddedAndFindsTheOldest) {
  for (const std::int32_t position : {30, 10, 20}) {
    this->AddKeyed("A", position, {});
    this->AddKeyed("B", position, {});
    this->Added({.Code = "c" + std::to_string(position), .Note = "same", .Whole = position});
  }
  EXPECT_EQ(this->OfOwner("A"), "A30 A10 A20 ");
  Sample oldest{.Note = "same"};
  ASSERT_TRUE(Find(this->store_, Sample::kByNote, oldest));
  EXPECT_EQ(oldest.Whole, 30);
  std::string every;
  for (const auto& keyed : Select(this->store_, kEveryRecord, Keyed{"none of them", 0, {}})) {
    every += keyed->OwnerId + std::to_string(keyed->Position) + " ";
  }
  EXPECT_EQ(every, "A30 B30 A10 B10 A20 B20 ");
}

TYPED_TEST(RecordStoreTest, FindsARecordByWhatItHoldsNow) {
  const std::int32_t first = this->Added({.Code = "first", .Note = "here"});
  this->Added({.Code = "second", .Note = "there"});
  this->Added({.Code = "third", .Note = "there"});
  EXPECT_EQ(this->OfNote("there"), "second third ");
  EXPECT_TRUE(Update(this->store_, Sample{.SampleId = first, .Code = "1st", .Note = "there"}));
  EXPECT_EQ(this->OfNote("there"), "1st second third ") << "in the order added, not that of the change";
  EXPECT_EQ(this->OfNote("here"), "");
  EXPECT_TRUE(Delete(this->store_, Sample{.SampleId = first}));
  EXPECT_EQ(this->OfNote("there"), "second third ");
  this->Added({.Code = "first", .Note = "there"});
  EXPECT_EQ(this->OfNote("there"), "second third first ");
}

TYPED_TEST(RecordStoreTest, TellsNullFromEmptyInALookup) {
  this->Added({.Code = "null"});
  this->Added({.Code = "empty", .Note = ""});
  this->Added({.Code = "null too"});
  EXPECT_EQ(Count(this->store_, Sample::kByNote, Sample{}), 2);
  EXPECT_EQ(Count(this->store_, Sample::kByNote, Sample{.Note = ""}), 1);
  EXPECT_EQ(Count(this->store_, Sample::kByNote, Sample{.Note = "' OR 1=1 --"}), 0);
}

TYPED_TEST(RecordStoreTest, WalksTheSameRecordsWithinAWalk) {
  for (const std::int32_t position : {1, 2, 3}) this->AddKeyed("A", position, "v");
  int pairs = 0;
  Keyed outer;
  const Keyed probe{"A", 0, {}};
  this->store_.Select(Keyed::kType, Keyed::kByOwner, &probe, [&]() -> void* {
    pairs += static_cast<int>(Select(this->store_, Keyed::kByOwner, probe).size());
    return &outer;
  });
  EXPECT_EQ(pairs, 9);
  EXPECT_EQ(outer.Position, 3);
  int given = 0;
  this->store_.Select(Keyed::kType, Keyed::kByOwner, &probe, [&]() -> void* { return ++given < 2 ? &outer : nullptr; });
  EXPECT_EQ(given, 2);
}

}  // namespace
}  // namespace partnerkit::testing
