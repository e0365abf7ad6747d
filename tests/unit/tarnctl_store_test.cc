// The host database file: creation, persistence between sessions, errors
// inside a change, and the host's lock. (Files that are not host databases:
// the hostile_store transcript.)
#include <chrono>
#include <thread>

#include "host_fixture.h"
#include "hostctl/tarnctl.h"
#include "tarnctl/admin.h"
#include "tarnctl/session.h"

namespace {

using TarnCtl::Detail::Session;
using TarnCtl::Detail::Transaction;

using StoreTest = HostTest;

int64_t CountRows(Session& session, const char* sql) {
  auto select = session.Prepare(sql);
  EXPECT_TRUE(select.Step());
  return select.Int(0);
}

TEST_F(StoreTest, MissingFileIsCreatedWithTheDefaultHost) {
  auto session = Session::Acquire();
  EXPECT_EQ(session->path(), path_);
  EXPECT_EQ(CountRows(*session, "SELECT count(*) FROM pnic"), 4);  // rest: tarnhost transcript
  EXPECT_FALSE(std::filesystem::exists(path_ + ".new"));
  // One session per process: a second acquisition shares it.
  EXPECT_EQ(Session::Acquire(), session);
  EXPECT_EQ(Session::Current(), session);
}

TEST_F(StoreTest, CommittedChangesPersistAndRolledBackOnesDoNot) {
  {
    auto session = Session::Acquire();
    Transaction kept(*session);
    session->Prepare("INSERT INTO pnic(seq, name) VALUES (?, ?)")
        .Bind(1, session->NextSeq())
        .Bind(2, std::string("pnic7"))
        .Run();
    kept.Commit();
    Transaction dropped(*session);
    session->Exec("INSERT INTO pnic(seq, name) VALUES (100, 'pnic8')");
  }
  EXPECT_EQ(Session::Current(), nullptr);
  auto session = Session::Acquire();
  EXPECT_EQ(CountRows(*session, "SELECT count(*) FROM pnic WHERE name = 'pnic7'"), 1);
  EXPECT_EQ(CountRows(*session, "SELECT count(*) FROM pnic WHERE name = 'pnic8'"), 0);
  // The counter moved on past the value it handed out.
  EXPECT_EQ(CountRows(*session, "SELECT seq FROM pnic WHERE name = 'pnic7'") + 1,
            session->NextSeq());
}

TEST_F(StoreTest, ADatabaseErrorNamesTheFileAndRollsBack) {
  auto session = Session::Acquire();
  const std::string message = Refusal([&] {
    Transaction transaction(*session);
    session->Exec("INSERT INTO pnic(seq, name) VALUES (50, 'pnic50')");
    session->Exec("INSERT INTO pnic(seq, name) VALUES (51, 'pnic0')");  // name taken
    transaction.Commit();
  });
  EXPECT_NE(message.find(path_), std::string::npos) << message;
  EXPECT_NE(message.find("UNIQUE"), std::string::npos) << message;
  EXPECT_EQ(CountRows(*session, "SELECT count(*) FROM pnic WHERE name = 'pnic50'"), 0);
}

TEST_F(StoreTest, AFullDatabaseRefusesTheChangeWhole) {
  TarnCtl::Network::NetworkInfoImpl network;
  auto session = Session::Current();
  const int64_t pages = CountRows(*session, "PRAGMA page_count");
  const std::string limit = "PRAGMA max_page_count=" + std::to_string(pages + 2);
  session->Exec(limit.c_str());
  auto vs0 = HostCtl::Network::NetworkFactory::GetVirtualSwitchById(
      "vswitch0", HostCtl::Network::PORTSET_GET_DEFAULT);
  std::string message;
  for (int i = 0; i < 2000 && message.empty(); ++i) {
    message = Refusal([&] { vs0->AddPortGroup("pg" + std::to_string(i) + std::string(100, 'x')); });
  }
  EXPECT_NE(message.find(path_), std::string::npos) << message;
  EXPECT_NE(message.find("full"), std::string::npos) << message;
  EXPECT_EQ(CountRows(*session, "SELECT count(*) FROM portgroup WHERE layer = 0"),
            CountRows(*session, "SELECT count(*) FROM portgroup WHERE layer = 1"));
  EXPECT_GT(CountRows(*session, "SELECT count(*) FROM portgroup"), 2);
}

TEST_F(StoreTest, ASecondProcessWaitsForTheLockAndThenGivesUp) {
  auto session = Session::Acquire();
  setenv("TARN_LOCK_TIMEOUT", "1", 1);
  const auto start = std::chrono::steady_clock::now();
  const int busy = InChild([this] {
    const std::string message = Refusal([] { Session::Acquire(); });
    return message == "Host " + path_ + " is busy: another process holds its lock" ? 0 : 1;
  });
  EXPECT_EQ(busy, 0);
  EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(900));

  // With time enough, the child gets the host once the parent lets go.
  setenv("TARN_LOCK_TIMEOUT", "20", 1);
  const pid_t pid = fork();
  if (pid == 0) {
    int status = 1;
    try {
      auto child = Session::Acquire();
      status = CountRows(*child, "SELECT count(*) FROM pnic WHERE name = 'late'") == 1 ? 0 : 2;
    } catch (...) {
      status = 3;
    }
    _exit(status);
  }
  std::this_thread::sleep_for(std::chrono::milliseconds(300));
  {
    Transaction transaction(*session);
    session->Exec("INSERT INTO pnic(seq, name) VALUES (60, 'late')");
    transaction.Commit();
  }
  session.reset();
  int status = 0;
  waitpid(pid, &status, 0);
  ASSERT_TRUE(WIFEXITED(status));
  EXPECT_EQ(WEXITSTATUS(status), 0);
}

TEST_F(StoreTest, InitAndRebootReplaceTheRightRows) {
  TarnCtl::Admin::Host host;
  auto session = Session::Current();
  ASSERT_NE(session, nullptr);
  host.Reboot();  // the running state goes (tarnhost transcript), the rest stays
  EXPECT_EQ(CountRows(*session, "SELECT count(*) FROM link"), 1);
  EXPECT_EQ(CountRows(*session, "SELECT count(*) FROM pnic"), 4);
  host.Init(true);
  host.Init(false);
  EXPECT_EQ(CountRows(*session, "SELECT count(*) FROM vswitch WHERE layer = 1"), 1);
  EXPECT_EQ(session->NextSeq(), 8);
}

}  // namespace
