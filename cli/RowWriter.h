// The common face of the output formats.
#pragma once

#include <cli/Row.h>

namespace cli {

/// What a command prints. Nothing is written before there is something in it or `finish`, so that a request
/// that fails at once leaves standard output empty.
class Document {
 public:
  Document() = default;
  virtual ~Document() = default;
  Document(const Document&) = delete;
  Document& operator=(const Document&) = delete;

  /// Ends the output; also after a failure that came later than its beginning, so that what is there is
  /// whole.
  virtual void finish() = 0;
};

/// Takes rows as they come, each with one value for each column that the writer was made with.
class RowWriter : public Document {
 public:
  virtual void write(Row row) = 0;
};

}  // namespace cli
