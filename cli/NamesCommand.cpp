#include <cimom/broker/WbemUri.h>
#include <cli/CimRows.h>
#include <cli/Commands.h>
#include <cli/Progress.h>
#include <cli/Session.h>
#include <cli/Terminal.h>
#include <cli/Text.h>
#include <cli/Writers.h>

#include <memory>
#include <string>

#include <unistd.h>

namespace cli {
namespace {

/// The paths alone, one a line, whole: half a path names nothing.
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

void runNames(const Options& options, Output& output) {
  Session session(options);
  const cimom::SchemaClass& info = session.classNamed(options.className);
  const Columns columns = nameColumns(info);
  const std::unique_ptr<RowWriter> writer = options.format == Format::Table
                                                ? std::make_unique<PathLines>(output)
                                                : makeWriter(options.format, columns, {}, output);
  Progress progress("Asking for " + info.name());
  const cimom::Outcome outcome =
      session.manager().enumerateInstanceNames(cimNamespace, info.name(), [&](const cimom::ObjectPath& path) {
        progress.stop();
        writer->write(rowOf(path, columns));
        return output.error() == 0;
      });
  progress.stop();
  session.conclude(outcome, "names " + info.name(), *writer, output);
}

}  // namespace cli
