#include <cimom/broker/WbemUri.h>
#include <cli/CimRows.h>
#include <cli/CimStatus.h>
#include <cli/Commands.h>
#include <cli/Messages.h>
#include <cli/Progress.h>
#include <cli/Session.h>
#include <cli/Writers.h>

#include <string>
#include <string_view>

namespace cli {
namespace {

/// An InstanceID holds no "=": what has one is an object path.
std::string pathOf(const Options& options) {
  if (options.object.find('=') != std::string::npos) {
    return options.object;
  }
  std::string path(cimNamespace);
  path.append(":").append(options.className).append(".InstanceID=\"");
  for (const char c : options.object) {
    path.append(c == '"' || c == '\\' ? "\\" : "").push_back(c);
  }
  return path + '"';
}

/// What stands between the namespace and the keys.
std::string classOf(const std::string& path) {
  const std::string_view beforeKeys = std::string_view(path).substr(0, path.find('='));
  const std::size_t begin = beforeKeys.rfind(':') + 1;  // 0 where there is no namespace
  return std::string(beforeKeys.substr(begin, beforeKeys.find('.', begin) - begin));
}

}  // namespace

void runGet(const Options& options, Output& output) {
  Session session(options);
  const std::string path = pathOf(options);
  const cimom::SchemaClass& info = session.classNamed(classOf(path));
  const Columns columns = chosenColumns(info, options);
  const auto writer = makeWriter(options.format, columns, {false, true}, output);
  Progress progress("Asking for " + options.object);
  const cimom::Outcome outcome = session.manager().getInstance(path, wantedProperties(info, columns),
                                                               [&](const cimom::Instance& instance) {
                                                                 progress.stop();
                                                                 writer->write(rowOf(instance, columns));
                                                                 return output.error() == 0;
                                                               });
  progress.stop();
  session.conclude(outcome, "get " + options.object, *writer, output);
}

}  // namespace cli
