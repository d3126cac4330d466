#include "host/schema.h"

#include <algorithm>
#include <fstream>

#include "host/sql_host.h"
#include "host/sql_session.h"
#include "host/sql_store.h"
#include "host/store_fixture.h"

namespace partnerkit::host {
namespace {

// `Sample` as a release before the last had it.
constexpr Member kOldMembers[] = {Id<&Sample::SampleId>("SampleId"), Field<&Sample::Code>("Code")};
constexpr RecordType kOldSample = {"Sample", "tbSample", kOldMembers, {}, ""};
constexpr std::array<const RecordType*, 1> kOldTypes = {&kOldSample};

class SchemaTest : public StoreTest {
 protected:
  void Open(std::int32_t version, std::span<const RecordType* const> types = kTestTypes) {
    SqlSession session(Path(), {});
    PrepareSchema(session, types, version);
  }
};

TEST_F(SchemaTest, BringsAnOlderStoreUpToDate) {
  Open(1, kOldTypes);
  Ask(Path(), "INSERT INTO tbSample(Code) VALUES('old')");
  Open(2);
  EXPECT_EQ(Ask(Path(), "SELECT Version FROM tbSchemaVersion"), "2");
  SqlSession session(Path(), {});
  SqlStore store(session);
  Sample old{.Code = "old", .Note = "x", .Whole = 5, .Flag = true, .Real = 5};
  ASSERT_TRUE(Find(store, Sample::kByCode, old));
  EXPECT_EQ(old.SampleId, 1);
  EXPECT_TRUE(!old.Note && old.Whole == 0 && !old.Flag && old.Real == 0);
  Sample twin{.Code = "old"};
  EXPECT_FALSE(Add(store, twin)) << "the new unique look-up is kept";
  Keyed keyed{"A", 1, "new table"};
  EXPECT_TRUE(Add(store, keyed));
}

TEST_F(SchemaTest, LeavesAnOlderStoreAloneThatItCannotBringUpToDate) {
  Open(1, kOldTypes);
  Ask(Path(), "INSERT INTO tbSample(Code) VALUES('twin'),('twin')");
  EXPECT_EQ(ErrorOf([&] { Open(2); }), Path() + ": UNIQUE constraint failed: tbSample.Code");
  EXPECT_EQ(Ask(Path(), "SELECT Version FROM tbSchemaVersion"), "1");
  EXPECT_EQ(Ask(Path(), "SELECT count(*) FROM pragma_table_info('tbSample')"), "2");
}

TEST_F(SchemaTest, RefusesWhatIsNoStoreOfItsOwn) {
  const auto open = [&](const std::string& url, bool create = true) {
    return ErrorOf([&] { SqlHost::Open(url, {.create = create}); });
  };
  Open(7);
  EXPECT_EQ(open(Path()), Path() + ": is of a newer version (7) than this program (2) understands");
  EXPECT_EQ(Ask(Path(), "SELECT count(*) FROM sqlite_master WHERE name='tbOrder'"), "0");
  std::ofstream(Path("letter.txt")) << std::string(5000, 'x');
  EXPECT_EQ(open(Path("letter.txt")), Path("letter.txt") + ": file is not a database");
  EXPECT_EQ(std::filesystem::file_size(Path("letter.txt")), 5000u);
  Ask(Path("other.db"), "CREATE TABLE songs(title)");
  EXPECT_EQ(open(Path("other.db")), Path("other.db") + ": is the database of another program");
  EXPECT_EQ(open(Path("")), Path("") + ": is a folder, not a database");
  EXPECT_EQ(open(Path("none/at/all.db")), Path("none/at/all.db") + ": unable to open the database file");
  EXPECT_EQ(open(Path("none.db"), false), Path("none.db") + ": there is no such database");
  EXPECT_FALSE(std::filesystem::exists(Path("none.db")));
  EXPECT_EQ(open("postgresql://host/store"), "postgresql://host/store: PostgreSQL is not built into this program");
  EXPECT_EQ(open("oracle:x://y"), "oracle:x://y: unknown kind of database");
  EXPECT_EQ(open(""), "database: no file is named");
}

TEST_F(SchemaTest, OpensAnyFileName) {
  for (const std::string name :
       {"plain.db", "with blank.db", "a=b.db", "odd = name with blanks.db", "it's \"quoted\".db", "file:x"}) {
    SCOPED_TRACE(name);
    SqlHost::Open("sqlite3://" + Path(name))->SetSetting("CompanyName", name);
    EXPECT_TRUE(std::filesystem::exists(Path(name)));
    EXPECT_EQ(SqlHost::Open(Path(name), {.create = false})->Setting("CompanyName"), name);
  }
}

TEST_F(SchemaTest, IsMadeOnceWhenSeveralProgramsOpenANewStoreAtATime) {
  pid_t children[6];
  for (pid_t& child : children)
    child = Fork([&] { SqlHost::Open(Path())->SetSetting(std::to_string(getpid()), "here"); });
  for (const pid_t child : children) EXPECT_EQ(Wait(child), 0);
  EXPECT_EQ(Ask(Path(), "SELECT count(*) FROM tbSystem"), "6");
  EXPECT_EQ(Ask(Path(), "SELECT count(*) FROM tbSchemaVersion"), "1");
}

}  // namespace
}  // namespace partnerkit::host
