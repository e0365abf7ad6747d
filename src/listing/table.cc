#include "listing/table.h"

namespace Listing {

void PrintHeader(std::ostream& out, Layout layout) {
  RowWriter row(out, layout);
  for (const Column& column : layout) row.Field(column.header);
  row.End();
}

void PrintEmptyLine(std::ostream& out) {
  out << std::endl;
}

}  // namespace Listing
