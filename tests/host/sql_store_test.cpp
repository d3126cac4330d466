#include "host/sql_store.h"

#include "host/schema.h"
#include "host/sql_session.h"
#include "host/store_fixture.h"

namespace partnerkit::host {
namespace {

class SqlStoreTest : public StoreTest, protected SampleRecords {
 protected:
  SqlStoreTest() { PrepareSchema(session_, kTestTypes); }
  RecordStore& Samples() override { return store_; }

  SqlSession session_{Path(), {}};
  SqlStore store_{session_};
};

TEST_F(SqlStoreTest, StoresDatesAsTextAndTellsNullFromEmptyText) {
  Added({.Code = "day", .Note = "", .Date = DateTime::FromYmd(2004, 7, 31)});
  Added({.Code = "last second", .Date = DateTime::FromYmdHms(9999, 12, 31, 23, 59, 59)});
  session_.Commit();
  EXPECT_EQ(Ask(Path(), "SELECT Date FROM tbSample WHERE SampleId=1"), "2004-07-31");
  EXPECT_EQ(Ask(Path(), "SELECT Date FROM tbSample WHERE SampleId=2"), "9999-12-31T23:59:59");
  EXPECT_EQ(Ask(Path(), "SELECT group_concat(typeof(Note)) FROM (SELECT Note FROM tbSample ORDER BY SampleId)"),
            "text,null");
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

TEST_F(SqlStoreTest, RefusesWithTheDatabasesNumber) {
  Added({.Code = "one"});
  Sample twin{.Code = "one"};
  EXPECT_FALSE(Add(store_, twin));
  EXPECT_EQ(store_.NativeError(), 2067);  // SQLITE_CONSTRAINT_UNIQUE
  const std::int32_t second = Added({.Code = "two"});
  EXPECT_FALSE(Update(store_, Sample{.SampleId = second, .Code = "one"}));
  EXPECT_EQ(store_.NativeError(), 2067);
}

TEST_F(SqlStoreTest, GoesThroughATypeByKey) {
  for (const std::int32_t position : {30, 10, 20}) {
    AddKeyed("B", position, {});
    AddKeyed("A", position, {});
  }
  std::string sorted;
  ForEach<Keyed>(store_, [&](const Keyed& keyed) { sorted += keyed.OwnerId + std::to_string(keyed.Position) + " "; });
  EXPECT_EQ(sorted, "A10 A20 A30 B10 B20 B30 ");
}

TEST_F(SqlStoreTest, EndsAWalkThatIsGivenNoFurtherPlace) {
  for (const std::int32_t position : {1, 2, 3}) AddKeyed("A", position, "v");
  const Keyed probe{"A", 0, {}};
  store_.Select(Keyed::kType, Keyed::kByOwner, &probe, []() -> void* { return nullptr; });
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
    EXPECT_EQ(Ask(Path(), "SELECT Code||' '||Note FROM tbSample ORDER BY SampleId DESC LIMIT 1"),
              std::string(kept).append(" ").append(kept));
    Sample found{.Code = given};
    ASSERT_TRUE(Find(store, Sample::kByCode, found));
    EXPECT_EQ(found.Code, given);
    EXPECT_EQ(found.Note, given);
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
