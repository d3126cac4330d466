#include "host/sql_store.h"

#include <limits>
#include <tuple>
#include <vector>

#include "host/schema.h"
#include "host/sql_session.h"
#include "host/store_fixture.h"

namespace partnerkit::host {
namespace {

class SqlStoreTest : public StoreTest {
 protected:
  SqlStoreTest() { PrepareSchema(session_, kTestTypes); }

  std::int32_t Added(Sample sample) {
    EXPECT_TRUE(Add(store_, sample)) << sample.Code;
    return sample.SampleId;
  }
  void AddKeyed(const std::string& owner, std::int32_t position, Text value) {
    Keyed keyed{owner, position, std::move(value)};
    EXPECT_TRUE(Add(store_, keyed));
  }
  Sample Stored(std::int32_t id) {
    Sample sample;
    sample.SampleId = id;
    EXPECT_TRUE(Load(store_, sample)) << id;
    return sample;
  }

  SqlSession session_{Path(), {}};
  SqlStore store_{session_};
};

auto Values(const Sample& s) { return std::tuple(s.Code, s.Note, s.Whole, s.Long, s.Flag, s.Real, s.Number, s.Date); }

TEST_F(SqlStoreTest, GivesBackEveryKindOfMemberAsItWasStored) {
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
    EXPECT_EQ(Values(Stored(Added(sample))), Values(sample)) << sample.Code;
    Sample found{.Code = sample.Code};
    ASSERT_TRUE(Find(store_, Sample::kByCode, found));
    EXPECT_EQ(Values(found), Values(sample)) << sample.Code;
  }
  session_.Commit();
  EXPECT_EQ(Ask(Path(), "SELECT Date FROM tbSample WHERE SampleId=2"), "2004-07-31");
  EXPECT_EQ(Ask(Path(), "SELECT Date FROM tbSample WHERE SampleId=4"), "9999-12-31T23:59:59");
  EXPECT_EQ(Ask(Path(), "SELECT group_concat(typeof(Note)) FROM (SELECT Note FROM tbSample ORDER BY SampleId)"),
            "null,text,text,text,null");
}

TEST_F(SqlStoreTest, GivesTheNextIdToARecordWithoutOne) {
  EXPECT_EQ(Added({.Code = "a"}), 1);
  EXPECT_EQ(Added({.SampleId = 70, .Code = "b"}), 70);
  EXPECT_EQ(Added({.Code = "c"}), 71);
  EXPECT_TRUE(Delete(store_, Sample{.SampleId = 71}));
  EXPECT_EQ(Added({.Code = "d"}), 72) << "what still names record 71 must not find another in its place";
  EXPECT_EQ(Added({.SampleId = 2147483647, .Code = "last"}), 2147483647);
  Sample beyond{.Code = "beyond"};
  EXPECT_FALSE(Add(store_, beyond));
  EXPECT_EQ(beyond.SampleId, 0);
}

TEST_F(SqlStoreTest, WritesByIdOrByKeyAndNothingThatItDoesNotFind) {
  const std::int32_t id = Added({.Code = "before", .Note = "n", .Whole = 1});
  const std::int32_t other = Added({.Code = "other", .Whole = 2});
  EXPECT_TRUE(Update(store_, Sample{.SampleId = id, .Code = "after", .Whole = 3}));
  EXPECT_EQ(Stored(id).Code, "after");
  EXPECT_EQ(Stored(id).Note, std::nullopt);
  EXPECT_EQ(Stored(other).Whole, 2);
  AddKeyed("A", 1, "one");
  AddKeyed("A", 2, "two");
  EXPECT_TRUE(Update(store_, Keyed{"A", 2, "deux"}));
  EXPECT_TRUE(Delete(store_, Keyed{"A", 1, {}}));
  const auto left = Select(store_, Keyed::kByOwner, Keyed{"A", 0, {}});
  ASSERT_EQ(left.size(), 1U);
  EXPECT_EQ(left[0]->Value, "deux");

  Sample mine{.SampleId = 9, .Code = "mine", .Note = "kept"};
  EXPECT_FALSE(Load(store_, mine) || Find(store_, Sample::kByCode, mine));
  EXPECT_EQ(mine.Note, "kept");
  EXPECT_FALSE(Update(store_, mine) || Delete(store_, mine));
  EXPECT_EQ(store_.NativeError(), 0);
}

TEST_F(SqlStoreTest, ReplacesWhatIsThereAndAddsWhatIsNot) {
  const std::int32_t id = Added({.Code = "first"});
  Sample same{.SampleId = id, .Code = "second"};
  Sample fresh{.SampleId = 40, .Code = "third"};
  Sample numbered{.Code = "fourth"};
  Sample clashing{.SampleId = 41, .Code = "third"};
  EXPECT_TRUE(store_.ReplaceOrAdd(Sample::kType, &same));
  EXPECT_TRUE(store_.ReplaceOrAdd(Sample::kType, &fresh));
  EXPECT_TRUE(store_.ReplaceOrAdd(Sample::kType, &numbered));
  EXPECT_FALSE(store_.ReplaceOrAdd(Sample::kType, &clashing));
  Keyed keyed{"K", 1, "old"}, again{"K", 1, "new"};
  EXPECT_TRUE(store_.ReplaceOrAdd(Keyed::kType, &keyed));
  EXPECT_TRUE(store_.ReplaceOrAdd(Keyed::kType, &again));
  std::string stored;
  ForEach<Sample>(store_, [&](const Sample& s) { stored += std::to_string(s.SampleId) + " " + s.Code + ", "; });
  ForEach<Keyed>(store_, [&](const Keyed& k) { stored += Str(k.Value); });
  EXPECT_EQ(stored, "1 second, 40 third, 41 fourth, new");
}

TEST_F(SqlStoreTest, RefusesASecondRecordOfAUniqueLookupOrKeyWithTheDatabasesNumber) {
  Added({.Code = "one"});
  Sample twin{.Code = "one", .Note = "twin"};
  EXPECT_FALSE(Add(store_, twin));
  EXPECT_EQ(store_.NativeError(), 2067);  // SQLITE_CONSTRAINT_UNIQUE
  const std::int32_t second = Added({.Code = "two"});
  EXPECT_EQ(store_.NativeError(), 0);
  EXPECT_FALSE(Update(store_, Sample{.SampleId = second, .Code = "one"}));
  EXPECT_EQ(store_.NativeError(), 2067);
  EXPECT_EQ(Stored(second).Code, "two");
  AddKeyed("A", 1, "first");
  Keyed keyed{"A", 1, "second"};
  EXPECT_FALSE(Add(store_, keyed));
  Sample notANumber{.Code = "nan", .Real = std::numeric_limits<double>::quiet_NaN()};
  EXPECT_FALSE(Add(store_, notANumber));
}

TEST_F(SqlStoreTest, SelectsInTheOrderAddedAndFindsTheOldest) {
  for (const std::int32_t position : {30, 10, 20}) {
    AddKeyed("A", position, {});
    AddKeyed("B", position, {});
    Added({.Code = "c" + std::to_string(position), .Note = "same", .Whole = position});
  }
  std::string added, sorted;
  for (const auto& keyed : Select(store_, Keyed::kByOwner, Keyed{"A", 0, {}})) {
    added += keyed->OwnerId + std::to_string(keyed->Position) + " ";
  }
  EXPECT_EQ(added, "A30 A10 A20 ");
  Sample oldest{.Note = "same"};
  ASSERT_TRUE(Find(store_, Sample::kByNote, oldest));
  EXPECT_EQ(oldest.Whole, 30);
  ForEach<Keyed>(store_, [&](const Keyed& keyed) { sorted += keyed.OwnerId + std::to_string(keyed.Position) + " "; });
  EXPECT_EQ(sorted, "A10 A20 A30 B10 B20 B30 ");
}

TEST_F(SqlStoreTest, TellsNullFromEmptyInALookup) {
  Added({.Code = "null"});
  Added({.Code = "empty", .Note = ""});
  Added({.Code = "null too"});
  EXPECT_EQ(Count(store_, Sample::kByNote, Sample{}), 2);
  EXPECT_EQ(Count(store_, Sample::kByNote, Sample{.Note = ""}), 1);
  EXPECT_EQ(Count(store_, Sample::kByNote, Sample{.Note = "' OR 1=1 --"}), 0);
}

TEST_F(SqlStoreTest, WalksTheSameRecordsWithinAWalk) {
  for (const std::int32_t position : {1, 2, 3}) AddKeyed("A", position, "v");
  int pairs = 0;
  Keyed outer;
  store_.Select(Keyed::kType, Keyed::kByOwner, std::make_unique<Keyed>(Keyed{"A", 0, {}}).get(), [&]() -> void* {
    pairs += static_cast<int>(Select(store_, Keyed::kByOwner, Keyed{"A", 0, {}}).size());
    return &outer;
  });
  EXPECT_EQ(pairs, 9);
  EXPECT_EQ(outer.Position, 3);
  store_.Select(Keyed::kType, Keyed::kByOwner, &outer, []() -> void* { return nullptr; });
  session_.Commit();
  EXPECT_EQ(Ask(Path(), "PRAGMA wal_checkpoint(TRUNCATE)"), "0") << "a walk that ended early still reads";
}

TEST_F(SqlStoreTest, PreparesEachStatementOnce) {
  const auto round = [&](int n) {
    const std::string code = std::to_string(n);
    const std::int32_t id = Added({.Code = code, .Note = "n"});
    Sample sample = Stored(id);
    EXPECT_TRUE(Find(store_, Sample::kByCode, sample));
    EXPECT_TRUE(Update(store_, sample));
    EXPECT_EQ(Count(store_, Sample::kByNote, sample), 1);
    EXPECT_EQ(Select(store_, Sample::kByNote, sample).size(), 1u);
    EXPECT_TRUE(Delete(store_, sample));
    session_.Commit();
  };
  round(0);
  const std::int64_t prepared = session_.Prepared();
  for (int n = 1; n <= 50; ++n) round(n);
  EXPECT_EQ(session_.Prepared(), prepared);
}

TEST_F(SqlStoreTest, KeepsPathsBelowItsFolderRelativeToIt) {
  const std::string folder = std::filesystem::path(Path()).parent_path();
  std::filesystem::create_directory_symlink(folder, folder + "-link");
  const std::pair<std::string, std::string> table[] = {
      {folder, "${workspace}"},
      {folder + "/maps/", "${workspace}/maps/"},
      {folder + "er/maps/", folder + "er/maps/"},
      {"x" + folder + "/maps/", "x" + folder + "/maps/"},
      {"${workspace}/maps/", "$${workspace}/maps/"},
      {"$$${workspace}", "$$$${workspace}"},
      {"${workspace", "${workspace"},
      {"$", "$"},
  };
  SqlSession session(folder + "/../" + std::filesystem::path(folder).filename().string() + "/store.db",
                     {.relativePaths = true});
  SqlStore store(session);
  for (const auto& [given, kept] : table) {
    Sample sample{.Code = given, .Note = given};
    ASSERT_TRUE(Add(store, sample));
    session.Commit();
    EXPECT_EQ(Ask(Path(), "SELECT Code||' '||Note FROM tbSample ORDER BY SampleId DESC LIMIT 1"), kept + " " + kept);
    Sample found{.Code = given};
    ASSERT_TRUE(Find(store, Sample::kByCode, found));
    EXPECT_EQ(found.Code + " " + found.Note.value_or(""), given + " " + given);
  }
  // By a link the same paths are found, and given back below it.
  SqlSession linked(folder + "-link/store.db", {.relativePaths = true});
  SqlStore linkedStore(linked);
  Sample found{.Code = folder + "/maps/"};
  ASSERT_TRUE(Find(linkedStore, Sample::kByCode, found));
  EXPECT_EQ(found.Note, folder + "-link/maps/");
  std::filesystem::remove(folder + "-link");
}

}  // namespace
}  // namespace partnerkit::host
