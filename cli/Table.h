// Rows for people: a table that fits the terminal, or one block for each object.
#pragma once

#include <cli/Output.h>
#include <cli/RowWriter.h>
#include <cli/Text.h>

#include <cstddef>
#include <string>
#include <vector>

namespace cli {

struct TableStyle {
  std::size_t width = 0;  ///< cells of a line; 0: no limit
  Charset charset = Charset::Utf8;
  bool dropEmptyColumns = false;  ///< leave out columns that have a value in no row
  bool records = false;           ///< one block of "name  value" lines for each object, nulls left out
};

/// Gathers all rows, then prints them. Columns are cut with an ellipsis to fit; where even that does not do,
/// columns with a rank are dropped, and where that does not do either, each object is printed as a block
/// whose values are wrapped. Of no rows nothing is printed.
class Table : public RowWriter {
 public:
  /// The output must outlive the table.
  Table(Columns columns, TableStyle style, Output& output);

  void write(Row row) override;
  void finish() override;

 private:
  using Cells = std::vector<std::string>;

  /// The columns to show, as indices, with their widths; empty where no table fits.
  struct Layout {
    std::vector<std::size_t> columns;
    std::vector<std::size_t> widths;
  };
  [[nodiscard]] std::vector<std::size_t> naturalWidths() const;
  [[nodiscard]] std::vector<std::size_t> shownColumns() const;
  [[nodiscard]] Layout layOut() const;
  void printLine(const Layout& layout, const Cells& cells);
  void printRecords();

  Columns columns_;
  TableStyle style_;
  Output& output_;
  std::vector<Cells> rows_;
};

/// A value as tables print it: dates as dates, numbers by what they stand for, references in short, lists
/// joined by commas, null as the empty text.
std::string cellText(const Value& value, const Column& column, Charset charset);

}  // namespace cli
