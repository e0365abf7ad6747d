// What the tests of every layer share: a temporary directory per test, a file
// read whole, a child process, and the texts of a refusal.
#pragma once

#include <gtest/gtest.h>
#include <stdlib.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <functional>
#include <iterator>
#include <string>
#include <utility>

#include "hostctl/exception.h"

// The message and the detailed message of the HostCtlException that `body`
// throws (both "" when none).
template <typename Body>
std::pair<std::string, std::string> Refused(Body body) {
  try {
    body();
  } catch (const HostCtl::Lib::HostCtlException& e) {
    return {e.GetMessage(), e.GetDetailedMessage()};
  }
  return {};
}
template <typename Body>
std::string Refusal(Body body) {
  return Refused(body).first;
}

inline std::string ReadFile(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), {}};
}

// Runs `body` in a child process; its exit status (99 when it threw, -1 on
// a signal).
inline int InChild(const std::function<int()>& body) {
  const pid_t pid = fork();
  if (pid == 0) {
    int status = 99;
    try {
      status = body();
    } catch (...) {
    }
    _exit(status);
  }
  int status = 0;
  waitpid(pid, &status, 0);
  return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

class ScratchTest : public ::testing::Test {
 protected:
  void SetUp() override {
    char pattern[] = "/tmp/tarnctl-test-XXXXXX";
    ASSERT_NE(mkdtemp(pattern), nullptr);
    dir_ = pattern;
  }
  void TearDown() override { std::filesystem::remove_all(dir_); }
  std::string Path(const std::string& name) const { return dir_ + "/" + name; }

  std::string dir_;
};
