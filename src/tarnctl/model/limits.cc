#include "tarnctl/model/limits.h"

#include "tarnctl/instrument/errors.h"

namespace TarnCtl::Model {

bool Within(const Range& range, int64_t value) {
  return value >= range.min && value <= range.max;
}

void Check(const Range& range, int64_t value) {
  Check(range, value, range.max);
}

void Check(const Range& range, int64_t value, int64_t max) {
  if (value >= range.min && value <= max) return;
  std::string message = range.refusal;
  message.replace(message.find("{}"), 2, std::to_string(value));
  throw Instrument::Refused(message, range.where != nullptr ? range.where
                                                            : "(" + std::to_string(range.min) +
                                                                  "-" + std::to_string(max) + ")");
}

}  // namespace TarnCtl::Model
