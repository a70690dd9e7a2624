#include <cli/CimRows.h>
#include <cli/Commands.h>
#include <cli/Progress.h>
#include <cli/Session.h>
#include <cli/Writers.h>

namespace cli {
void runNames(const Options& options, Output& output) {
  Session session(options);
  const cimom::SchemaClass& info = session.classNamed(options.className);
  const Columns columns = nameColumns(info);
  const auto writer = makeNamesWriter(options.format, columns, output);
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
