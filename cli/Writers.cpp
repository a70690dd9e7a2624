#include <cli/CsvOutput.h>
#include <cli/JsonOutput.h>
#include <cli/Table.h>
#include <cli/Terminal.h>
#include <cli/Text.h>
#include <cli/Writers.h>

#include <utility>
#include <variant>

#include <unistd.h>

namespace cli {
namespace {

class PathLines : public RowWriter {
 public:
  explicit PathLines(Output& output) : output_(output), charset_(terminalAt(STDOUT_FILENO).values) {}

  void write(Row row) override {
    const auto& path = std::get<Reference>(std::get<Scalar>(row.front()));
    output_.write(printable(path.uri, charset_) + "\n");
  }
  void finish() override {}

 private:
  Output& output_;
  Charset charset_;
};

}  // namespace

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

std::unique_ptr<RowWriter> makeNamesWriter(Format format, Columns columns, Output& output) {
  if (format == Format::Table) {
    return std::make_unique<PathLines>(output);
  }
  return makeWriter(format, std::move(columns), {}, output);
}

}  // namespace cli
