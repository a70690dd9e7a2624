#include <cli/CimRows.h>
#include <cli/Commands.h>
#include <cli/ObjectArgument.h>
#include <cli/Progress.h>
#include <cli/Session.h>
#include <cli/Writers.h>

#include <string>

namespace cli {

void runGet(const Options& options, Output& output) {
  Session session(options);
  const std::string what = "get " + options.object;
  Progress progress("Asking for " + options.object);
  const NamedObject object = namedObject(session, options.object, what);
  const Columns columns = chosenColumns(*object.info, options);
  const auto writer = makeWriter(options.format, columns, {false, true}, output);
  cimom::Outcome outcome = session.manager().getInstance(object.path, wantedProperties(*object.info, columns),
                                                         [&](const cimom::Instance& instance) {
                                                           progress.stop();
                                                           writer->write(rowOf(instance, columns));
                                                           return output.error() == 0;
                                                         });
  progress.stop();
  if (outcome.status.code == CMPI_RC_ERR_NOT_SUPPORTED && outcome.status.description.empty()) {
    const std::string& name = object.info->name();
    outcome.status.description =
        "the provider gives no single " + name + "; 'swinv list " + name + "' shows all";
  }
  session.conclude(outcome, what, *writer, output);
}

}  // namespace cli
