// The common face of the output formats.
#pragma once

#include <cli/Row.h>

namespace cli {

/// Takes rows as they come, each with one value for each column that the writer was made with. Nothing is
/// written before the first row or `finish`, so that a request that fails at once leaves standard output
/// empty.
class RowWriter {
 public:
  RowWriter() = default;
  virtual ~RowWriter() = default;
  RowWriter(const RowWriter&) = delete;
  RowWriter& operator=(const RowWriter&) = delete;

  virtual void write(Row row) = 0;
  /// Ends the output; also after a failure that came later than the first row, so that what is there is
  /// whole.
  virtual void finish() = 0;
};

}  // namespace cli
