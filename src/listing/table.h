// Fixed-width tables of the -l listing: every field is left-aligned and
// padded with spaces to its column's width, and never cut (a longer value
// pushes the rest of the line to the right). A row is written whole, and
// flushed, when it ends; a row that fails half-way is written as far as
// it got, without a line end, when its writer goes (before the error line:
// standard error is tied to standard output).
#pragma once

#include <charconv>
#include <cstddef>
#include <ostream>
#include <span>
#include <string>
#include <string_view>
#include <type_traits>

namespace Listing {

struct Column {
  std::string_view header;
  int width;
};

using Layout = std::span<const Column>;

// The single space of the gap column and of the indent of a sub-table.
inline constexpr std::string_view kGap = " ";

// Writes the header line of `layout`: every header padded to its width.
void PrintHeader(std::ostream& out, Layout layout);

// Writes an empty line.
void PrintEmptyLine(std::ostream& out);

// Writes one row field by field, in the order of the layout's columns.
class RowWriter {
 public:
  RowWriter(std::ostream& out, Layout layout) : out_(out), layout_(layout) {}
  ~RowWriter() {
    if (!ended_) out_ << line_;
  }
  RowWriter(const RowWriter&) = delete;
  RowWriter& operator=(const RowWriter&) = delete;

  // Prints `value` in the next column. Numbers print in decimal.
  template <typename T>
  void Field(const T& value) {
    const size_t start = line_.size();
    if constexpr (std::is_integral_v<T>) {
      char digits[24];
      line_.append(digits, std::to_chars(digits, digits + sizeof digits, value).ptr);
    } else {
      line_.append(std::string_view(value));
    }
    const size_t width = static_cast<size_t>(layout_[next_++].width);
    if (line_.size() - start < width) line_.append(width - (line_.size() - start), ' ');
  }

  // Ends the row; columns not printed are left out.
  void End() {
    ended_ = true;
    out_ << line_ << std::endl;
  }

 private:
  std::ostream& out_;
  Layout layout_;
  std::size_t next_ = 0;
  std::string line_;
  bool ended_ = false;
};

}  // namespace Listing
