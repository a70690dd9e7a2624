// The writer for a format.
#pragma once

#include <cli/Options.h>
#include <cli/Output.h>
#include <cli/RowWriter.h>

#include <memory>

namespace cli {

/// How a table is to look, beyond what the terminal decides.
struct TableWishes {
  bool dropEmptyColumns = false;
  bool records = false;
};

/// The output must outlive the writer. `output` is standard output.
std::unique_ptr<RowWriter> makeWriter(Format format, Columns columns, TableWishes wishes, Output& output);

/// For rows that begin with a path: as tables, the paths alone, one a line and whole, because half a path
/// names nothing.
std::unique_ptr<RowWriter> makeNamesWriter(Format format, Columns columns, Output& output);

}  // namespace cli
