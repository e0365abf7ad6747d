// Fixed-width tables of the -l listing: every field is left-aligned and
// padded with spaces to its column's width, and never cut (a longer value
// pushes the rest of the line to the right). Output is flushed after every
// field, so a row that fails half-way leaves exactly the fields printed so
// far, without a line end.
#pragma once

#include <cstddef>
#include <iomanip>
#include <ostream>
#include <span>
#include <string_view>

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

  // Prints `value` in the next column. Numbers print in decimal.
  template <typename T>
  void Field(const T& value) {
    const Column& column = layout_[next_++];
    out_ << std::left << std::setw(column.width) << value << std::flush;
  }

  // Ends the row; columns not printed are left out.
  void End() { out_ << std::endl; }

 private:
  std::ostream& out_;
  Layout layout_;
  std::size_t next_ = 0;
};

}  // namespace Listing
