// Every line written to std::cout is flushed through stdio at once. A failed
// write sets stdout's error flag, but stdio drops the unwritten bytes and
// errno is long gone by the time the run ends: the first failure's errno is
// kept on the way.
#include "cli/output.h"

#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <iostream>
#include <streambuf>

namespace Cli {
namespace {

// Passes every write and flush on unbuffered, to the stream buffer std::cout
// had, and notes the errno of the first that fails.
class FailureNotingBuf final : public std::streambuf {
 public:
  explicit FailureNotingBuf(std::streambuf* target) : target_(target) {}
  int FirstError() const { return firstError_; }

 protected:
  int_type overflow(int_type c) override {
    if (traits_type::eq_int_type(c, traits_type::eof())) {
      return Noted(target_->pubsync() == 0) ? traits_type::not_eof(c) : traits_type::eof();
    }
    const int_type put = target_->sputc(traits_type::to_char_type(c));
    return Noted(!traits_type::eq_int_type(put, traits_type::eof())) ? c : traits_type::eof();
  }
  std::streamsize xsputn(const char* text, std::streamsize count) override {
    const std::streamsize written = target_->sputn(text, count);
    Noted(written == count);
    return written;
  }
  int sync() override { return Noted(target_->pubsync() == 0) ? 0 : -1; }

 private:
  bool Noted(bool ok) {
    if (!ok && firstError_ == 0) firstError_ = errno;
    return ok;
  }

  std::streambuf* target_;
  int firstError_ = 0;
};

// Never destroyed: std::cout uses it until the process ends.
FailureNotingBuf* noting = nullptr;
bool checked = true;

void CheckOutput() {
  if (!checked) return;
  int error = noting->FirstError();
  const bool flushed = std::fflush(stdout) == 0;
  if (!flushed && error == 0) error = errno;
  if (flushed && !std::ferror(stdout) && !std::cout.bad()) return;
  // A closed pipe ends the run as before: by SIGPIPE, or quietly where the
  // signal is ignored.
  if (error == EPIPE) return;
  std::fprintf(stderr, "orvocfg-vswitch: error writing standard output%s%s\n",
               error != 0 ? ": " : "", error != 0 ? std::strerror(error) : "");
  _exit(1);
}

}  // namespace

void CheckOutputAtExit() {
  noting = new FailureNotingBuf(std::cout.rdbuf());
  std::cout.rdbuf(noting);
  std::atexit(CheckOutput);
}

void SkipOutputCheck() {
  checked = false;
}

}  // namespace Cli
