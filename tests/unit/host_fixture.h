// A fresh host database per test: TARN_HOST_DB points into a temporary
// directory of the test's own, and tracing is off unless a test turns it on.
#pragma once

#include <gtest/gtest.h>
#include <stdlib.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <functional>
#include <sstream>
#include <string>
#include <vector>

#include "hostctl/exception.h"

class HostTest : public ::testing::Test {
 protected:
  void SetUp() override {
    char pattern[] = "/tmp/tarnctl-test-XXXXXX";
    ASSERT_NE(mkdtemp(pattern), nullptr);
    dir_ = pattern;
    path_ = dir_ + "/host.db";
    setenv("TARN_HOST_DB", path_.c_str(), 1);
    unsetenv("TARN_TRACE");
    unsetenv("TARN_LOCK_TIMEOUT");
  }

  void TearDown() override {
    unsetenv("TARN_HOST_DB");
    unsetenv("TARN_TRACE");
    unsetenv("TARN_LOCK_TIMEOUT");
    std::filesystem::remove_all(dir_);
  }

  // Turns the trace on into a file of the test's directory.
  void StartTrace() { setenv("TARN_TRACE", TracePath().c_str(), 1); }
  std::string TracePath() const { return dir_ + "/trace"; }
  std::vector<std::string> TraceLines() const {
    std::ifstream in(TracePath());
    std::vector<std::string> lines;
    for (std::string line; std::getline(in, line);) lines.push_back(line);
    return lines;
  }

  static std::string ReadFile(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    std::stringstream bytes;
    bytes << in.rdbuf();
    return bytes.str();
  }
  static void WriteFile(const std::string& path, const std::string& bytes) {
    std::ofstream(path, std::ios::binary) << bytes;
  }

  // Runs `body` in a child process; its exit status (or -1 on a signal).
  static int InChild(const std::function<int()>& body) {
    const pid_t pid = fork();
    if (pid == 0) {
      int status = 1;
      try {
        status = body();
      } catch (...) {
        status = 99;
      }
      _exit(status);
    }
    int status = 0;
    waitpid(pid, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  }

  // The message of the HostCtlException that `body` throws ("" when none).
  template <typename Body>
  static std::string Refusal(Body body) {
    try {
      body();
    } catch (const HostCtl::Lib::HostCtlException& e) {
      return e.GetMessage();
    }
    return "";
  }

  std::string dir_;
  std::string path_;
};
