#include <cli/CimRows.h>
#include <cli/Commands.h>
#include <cli/Progress.h>
#include <cli/Session.h>
#include <cli/Writers.h>

namespace cli {

void runList(const Options& options, Output& output) {
  Session session(options);
  const cimom::SchemaClass& info = session.classNamed(options.className);
  const Columns columns = chosenColumns(info, options);
  const bool asked = !options.properties.empty();
  const auto writer = makeWriter(options.format, columns, {!asked, false}, output);
  Progress progress("Asking for " + info.name());
  const cimom::Outcome outcome = session.manager().enumerateInstances(
      cimNamespace, info.name(), wantedProperties(info, columns), [&](const cimom::Instance& instance) {
        progress.stop();
        writer->write(rowOf(instance, columns));
        return output.error() == 0;
      });
  progress.stop();
  session.conclude(outcome, "list " + info.name(), *writer, output);
}

}  // namespace cli
