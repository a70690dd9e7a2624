// Rows as JSON: one list of objects.
#pragma once

#include <cli/Output.h>
#include <cli/RowWriter.h>

#include <memory>
#include <string>
#include <utility>

namespace cli {

/// Writes each row as an object whose members have the names and the order of the columns; null properties
/// are left out. Datetimes are their CIM texts, references WBEM URIs. The text is valid UTF-8 and holds no
/// control characters: also those above ASCII are escaped.
class JsonOutput : public RowWriter {
 public:
  /// The output must outlive the writer.
  JsonOutput(Columns columns, Output& output);
  ~JsonOutput() override;

  /// The columns of the rows that follow: objects of one list may be of several kinds.
  void use(Columns columns) { columns_ = std::move(columns); }

  void write(Row row) override;
  void finish() override;

 private:
  struct Writer;
  void handOver();

  Columns columns_;
  Output& output_;
  std::unique_ptr<Writer> writer_;
};

/// Escapes DEL and the control characters U+0080 to U+009F in a JSON text, where they can stand in strings
/// alone.
std::string escapeHighControls(std::string_view json);

}  // namespace cli
