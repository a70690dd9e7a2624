#include <cli/CsvOutput.h>
#include <cli/JsonOutput.h>
#include <cli/Table.h>
#include <cli/Terminal.h>
#include <cli/Writers.h>

#include <utility>

#include <unistd.h>

namespace cli {

std::unique_ptr<RowWriter> makeWriter(Format format, Columns columns, TableWishes wishes, Output& output) {
  const Terminal terminal = terminalAt(STDOUT_FILENO);
  switch (format) {
    case Format::Json:
      return std::make_unique<JsonOutput>(std::move(columns), output);
    case Format::Csv:
      return std::make_unique<CsvOutput>(std::move(columns), terminal.isTerminal, output);
    case Format::Table:
      break;
  }
  const TableStyle style{terminal.width, terminal.values, wishes.dropEmptyColumns, wishes.records};
  return std::make_unique<Table>(std::move(columns), style, output);
}

}  // namespace cli
