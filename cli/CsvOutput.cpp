#include <cli/CsvOutput.h>
#include <cli/ScalarText.h>
#include <cli/Text.h>

#include <utility>

namespace cli {
namespace {

std::string fieldOf(const Value& value, bool forTerminal) {
  if (isNull(value)) {
    return {};
  }
  std::string text;
  if (const Scalar* scalar = std::get_if<Scalar>(&value)) {
    text = scalarText(*scalar);
  } else {
    bool first = true;
    for (const Scalar& element : std::get<std::vector<Scalar>>(value)) {
      text.append(std::exchange(first, false) ? "" : ";").append(scalarText(element));
    }
  }
  return csvField(forTerminal ? printable(text, Charset::Utf8) : validUtf8(text));
}

}  // namespace

CsvOutput::CsvOutput(Columns columns, bool forTerminal, Output& output)
    : columns_(std::move(columns)), forTerminal_(forTerminal), output_(output) {}

void CsvOutput::write(Row row) {
  writeHeader();
  std::string line;
  for (std::size_t i = 0; i < columns_.size(); ++i) {
    line.append(i == 0 ? "" : ",").append(fieldOf(row[i], forTerminal_));
  }
  output_.write(line.append("\r\n"));
}

void CsvOutput::finish() {
  writeHeader();
}

void CsvOutput::writeHeader() {
  if (std::exchange(headerWritten_, true)) {
    return;
  }
  std::string line;
  for (const Column& column : columns_) {
    line.append(line.empty() ? "" : ",").append(csvField(column.name));
  }
  output_.write(line.append("\r\n"));
}

std::string csvField(std::string_view text) {
  const bool plain = !text.empty() && text.find_first_of("\",\r\n") == std::string_view::npos &&
                     text.front() != ' ' && text.back() != ' ';
  if (plain) {
    return std::string(text);
  }
  std::string quoted = "\"";
  for (const char c : text) {
    quoted.append(c == '"' ? 2U : 1U, c);
  }
  return quoted + '"';
}

}  // namespace cli
