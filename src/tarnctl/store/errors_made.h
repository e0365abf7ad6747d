// The library's exceptions note their messages here as they are made: a
// destructor that runs while one is in flight (the trace's record of a call
// that failed) cannot read it otherwise.
#pragma once

#include <cstdint>
#include <string>

namespace TarnCtl::Store {

struct ErrorMade {
  uint64_t count = 0;  // exceptions made so far in this process
  std::string message;
};

inline ErrorMade& LastErrorMade() {
  static ErrorMade last;
  return last;
}

inline void NoteErrorMade(const std::string& message) {
  ErrorMade& last = LastErrorMade();
  ++last.count;
  last.message = message;
}

}  // namespace TarnCtl::Store
