// Rows as comma-separated values (RFC 4180).
#pragma once

#include <cli/Output.h>
#include <cli/RowWriter.h>

#include <string>

namespace cli {

/// Writes a line of column names, then a line for each row. Values are as in JSON; the elements of a list are
/// joined by ";". A null value is an empty field, an empty text a quoted one. Lines end in CRLF.
class CsvOutput : public RowWriter {
 public:
  /// With `forTerminal`, control characters are replaced. The output must outlive the writer.
  CsvOutput(Columns columns, bool forTerminal, Output& output);

  void write(Row row) override;
  void finish() override;

 private:
  void writeHeader();

  Columns columns_;
  bool forTerminal_;
  bool headerWritten_ = false;
  Output& output_;
};

/// A text as a field, in quotes where it needs them.
std::string csvField(std::string_view text);

}  // namespace cli
