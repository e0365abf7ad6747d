// The host file below the library: where it lives, what is refused without
// being touched, creation in place, the lock on the file whatever path
// reaches it, transactions, and the reset from the known schema.
#include <sys/stat.h>

#include "scratch.h"
#include "tarnctl/store/host_file.h"
#include "tarnctl/store/pnics.h"
#include "tarnctl/store/policy_codec.h"
#include "tarnctl/store/reset.h"
#include "tarnctl/store/rows.h"
#include "tarnctl/store/transaction.h"

namespace {

namespace fs = std::filesystem;
using namespace TarnCtl::Store;

class StoreTest : public ScratchTest {
 protected:
  static std::unique_ptr<HostFile> Open(const std::string& path, int lockTimeout = 0) {
    return HostFile::Open(Location::File(path), {lockTimeout, true});
  }
  // The names in the directory, sorted.
  std::vector<std::string> Listing() const {
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(dir_)) {
      names.push_back(entry.path().filename());
    }
    std::sort(names.begin(), names.end());
    return names;
  }
};

TEST_F(StoreTest, LocationFollowsTheEnvironment) {
  const struct {
    Environment environment;
    const char* path;
  } cases[] = {
      {{"/x/h.db", "/state", "/home/u", true}, "/x/h.db"},
      {{"", "/state", "/home/u", true}, "/var/lib/tarnhost/host.db"},
      {{nullptr, "/state", "/home/u", false}, "/state/tarnhost/host.db"},
      {{nullptr, "relative", "/home/u", false}, "/home/u/.local/state/tarnhost/host.db"},
      {{nullptr, nullptr, nullptr, false}, "./.local/state/tarnhost/host.db"},
  };
  for (const auto& c : cases) EXPECT_EQ(ResolveLocation(c.environment).path, c.path);
  EXPECT_EQ(Refusal([] {
              ResolveLocation({"~/h.db", nullptr, "/home/u", false});
            }),
            "TARN_HOST_DB=~/h.db starts with \"~\", which only a shell expands; write the full "
            "path (for example TARN_HOST_DB=$HOME/h.db)");
}

TEST_F(StoreTest, AMissingOrEmptyFileBecomesTheDefaultHostInPlace) {
  const std::string missing = Path("sub/dir/host.db");
  const std::string empty = Path("empty.db");
  std::ofstream{empty};
  for (const auto& path : {missing, empty}) {
    auto host = Open(path);
    EXPECT_TRUE(host->created()) << path;
    EXPECT_EQ(Pnics::Names(host->db()).size(), 4u);
  }
  EXPECT_FALSE(Open(missing)->created());
  // Nothing but the host files and their logs, empty between runs: no lock
  // files, no journals.
  EXPECT_EQ(Listing(), (std::vector<std::string>{"empty.db", "empty.db-wal", "sub"}));
  EXPECT_EQ(fs::file_size(Path("empty.db-wal")), 0u);
  EXPECT_EQ(Refusal([&] {
              HostFile::Open(Location::File(Path("none.db")), {0, false});
            }),
            "Cannot open host database " + Path("none.db") + ": no host yet; run tarnhost init");
}

// What is not a host of this library is refused as it is, in one line that
// names the file, the cause and the way out: its bytes stay, its leftover
// journal or log is not replayed, nothing appears beside it, and a FIFO does
// not hang the opening.
TEST_F(StoreTest, FilesThatAreNotHostsAreLeftAlone) {
  Open(Path("host.db"));
  auto other = Db::OpenFile(Path("host.db"), "host");  // an SQLite file of another program
  fs::copy(Path("host.db"), Path("foreign.db"));
  {
    auto foreign = Db::OpenFile(Path("foreign.db"), "foreign");
    foreign->Exec(
        "PRAGMA application_id=7; PRAGMA journal_mode=WAL; CREATE TABLE t(x);"
        "PRAGMA wal_autocheckpoint=0; INSERT INTO t VALUES (1)");
    fs::copy(Path("foreign.db-wal"), Path("saved-wal"));  // left behind as by a crash
  }
  fs::copy(Path("saved-wal"), Path("foreign.db-wal"), fs::copy_options::overwrite_existing);
  fs::copy(Path("host.db"), Path("newer.db"));
  fs::copy(Path("host.db"), Path("cut.db"));
  fs::resize_file(Path("cut.db"), 4096);
  Db::OpenFile(Path("newer.db"), "newer")->Exec("PRAGMA user_version=9");
  std::ofstream(Path("text.db")) << std::string(300, 't');
  std::ofstream(Path("short.db")) << std::string("SQLite format 3\0\x10\0", 19);
  fs::create_directory(Path("dir.db"));
  ASSERT_EQ(mkfifo(Path("fifo.db").c_str(), 0644), 0);

  const std::string init =
      "; set TARN_HOST_DB to a host file, or move it away and run tarnhost init";
  const struct {
    const char* name;
    std::string rest;  // of the message, after the path
  } cases[] = {
      {"foreign.db", "not a host database (application id 0x7)" + init},
      {"newer.db",
       "schema version 9 is newer than this library's 2; use the newer release that made it, or "
       "set TARN_HOST_DB to another host file"},
      {"text.db", "not a host database (not an SQLite database)" + init},
      {"short.db", "not a host database (truncated header)" + init},
      {"cut.db",
       "database disk image is malformed; the host was not changed; keep a copy of it and of its "
       "log (the file beside it ending in -wal) before you repair or replace it"},
      {"dir.db", "is a directory; set TARN_HOST_DB to a host file"},
      {"fifo.db", "is not a regular file; set TARN_HOST_DB to a host file"},
  };
  const auto before = Listing();
  for (const auto& c : cases) {
    const std::string path = Path(c.name);
    const std::string bytes = fs::is_regular_file(path) ? ReadFile(path) : "";
    EXPECT_EQ(Refusal([&] { Open(path); }), "Cannot open host database " + path + ": " + c.rest);
    if (fs::is_regular_file(path)) {
      EXPECT_EQ(ReadFile(path), bytes) << c.name;
    }
  }
  EXPECT_EQ(ReadFile(Path("foreign.db-wal")), ReadFile(Path("saved-wal")));
  EXPECT_EQ(Listing(), before);
}

// The next opening copies the commit in and empties the log, as every
// commit does.
TEST_F(StoreTest, AKilledRunsCommitIsCopiedInByTheNextOpening) {
  const std::string host = Path("host.db");
  Open(host);
  {
    auto killed = Db::OpenFile(host, "host");  // commits without copying in
    killed->Exec(
        "PRAGMA locking_mode=EXCLUSIVE; PRAGMA wal_autocheckpoint=0;"
        " INSERT INTO meta VALUES ('left', 'in the log')");
    fs::copy(host, Path("file"));
    fs::copy(host + "-wal", Path("log"));
  }
  fs::copy(Path("file"), host, fs::copy_options::overwrite_existing);
  fs::copy(Path("log"), host + "-wal", fs::copy_options::overwrite_existing);
  ASSERT_GT(fs::file_size(host + "-wal"), 0u);
  auto opened = Open(host);
  EXPECT_EQ(fs::file_size(host + "-wal"), 0u);
  {
    auto row = opened->db().Prepare("SELECT value FROM meta WHERE key = 'left'");
    ASSERT_TRUE(row.Step());
    EXPECT_EQ(row.Text(0), "in the log");
  }
  Transaction change(opened->db());
  opened->db().Exec("INSERT INTO meta VALUES ('next', 'copied in at its commit')");
  change.Commit();
  EXPECT_EQ(fs::file_size(host + "-wal"), 0u);  // not only when the connection closes
}

// SQLite always opens the file by one name, so its journal is shared too.
TEST_F(StoreTest, EveryPathToTheFileSharesItsLock) {
  auto held = Open(Path("host.db"));
  fs::create_symlink(Path("host.db"), Path("alias.db"));
  fs::create_hard_link(Path("host.db"), Path("hard.db"));
  for (const char* name : {"host.db", "alias.db", "hard.db"}) {
    const std::string path = Path(name);
    EXPECT_EQ(InChild([&] {
                return Refusal([&] { Open(path); }) ==
                               "Host " + path + " is busy: another process holds its lock"
                           ? 0
                           : 1;
              }),
              0)
        << name;
  }
  held.reset();
  // A hard link elsewhere could not share SQLite's journal: refused.
  fs::create_directory(Path("elsewhere"));
  fs::create_hard_link(Path("host.db"), Path("elsewhere/far.db"));
  EXPECT_NE(Refusal([&] { Open(Path("hard.db")); }).find("hard link in another directory"),
            std::string::npos);
}

// The busy timeout is set before anything is read: a program holding an
// SQLite transaction on the file only delays the opening.
TEST_F(StoreTest, AnotherConnectionsTransactionIsWaitedFor) {
  Open(Path("host.db"));
  int ready[2];
  ASSERT_EQ(pipe(ready), 0);
  const pid_t pid = fork();
  if (pid == 0) {
    auto other = Db::OpenFile(Path("host.db"), "other");
    other->Exec("BEGIN EXCLUSIVE; DELETE FROM pnic WHERE name = 'pnic3'");
    if (write(ready[1], "x", 1) != 1) _exit(1);
    usleep(300 * 1000);
    other->Exec("COMMIT");
    _exit(0);
  }
  char byte;
  ASSERT_EQ(read(ready[0], &byte, 1), 1);
  auto host = Open(Path("host.db"));
  EXPECT_EQ(Pnics::Names(host->db()).size(), 3u);
  waitpid(pid, nullptr, 0);
}

TEST_F(StoreTest, TransactionsNestAndUndoWhole) {
  {
    auto host = Open(Path("host.db"));
    Db& db = host->db();
    Transaction outer(db);
    Pnics::Insert(db, "kept", 100);
    {
      Transaction inner(db);
      Pnics::Insert(db, "dropped", 101);
    }
    {
      Transaction inner(db);
      Pnics::Insert(db, "inner", 102);
      inner.Commit();
    }
    outer.Commit();
    Transaction undone(db);
    Pnics::Insert(db, "undone", 103);
  }
  auto host = Open(Path("host.db"));
  EXPECT_EQ(Pnics::Names(host->db()),
            (std::vector<std::string>{"pnic0", "pnic1", "pnic2", "pnic3", "kept", "inner"}));
  // A failing statement names the file.
  EXPECT_EQ(Refusal([&] { Pnics::Insert(host->db(), "pnic0", 200); }),
            "Host database " + Path("host.db") + ": UNIQUE constraint failed: pnic.name");
}

// A reset builds the host from the library's own schema, whatever tables
// the file holds: none is named into SQL from the file.
TEST_F(StoreTest, RebuildUsesOnlyTheKnownSchema) {
  auto schema = [](Db& db) {
    std::vector<std::string> names;
    auto select = db.Prepare("SELECT name FROM sqlite_schema ORDER BY name");
    while (select.Step()) names.push_back(select.Text(0));
    return names;
  };
  auto host = Open(Path("host.db"));
  Db& db = host->db();
  db.Exec("DROP TABLE link; CREATE TABLE \"pnic\"\"; CREATE TABLE survivor(x); --\"(x)");
  Transaction transaction(db);
  Reset::Rebuild(db, false);
  transaction.Commit();
  EXPECT_EQ(schema(db), schema(HostFile::Open(Location::Memory(), {})->db()));
  EXPECT_EQ(Pnics::Names(db).size(), 4u);
}

TEST_F(StoreTest, PoliciesKeepEveryFieldAndRefuseMalformedText) {
  HostCtl::Network::NicTeamingPolicy policy;
  policy.flags = ~0ull;
  policy.balancing = 65535;
  policy.linkCriteria.errorPercent = 7;
  policy.uplinkOrder = {"a", "b"};
  policy.maxActive = -3;
  const auto back = DecodeTeamingPolicy(EncodeTeamingPolicy(policy));
  EXPECT_EQ(PolicyToJson(back, PolicyForm::kFull), PolicyToJson(policy, PolicyForm::kFull));
  EXPECT_EQ(EncodeTeamingPolicy({}), "{}");
  for (const char* text : {"[]", "{\"balancing\":65536}", "{\"maxActive\":\"1\"}", "{"}) {
    EXPECT_EQ(Refusal([&] { DecodeTeamingPolicy(text); }), "Stored teaming policy is malformed")
        << text;
  }
  EXPECT_THROW(PolicyFromJson(Json::object(), PolicyForm::kFull), FormatError);
}

}  // namespace
