#include <cimom/broker/WbemUri.h>
#include <cli/BriefPath.h>
#include <cli/CimStatus.h>
#include <cli/Messages.h>
#include <cli/ObjectArgument.h>

#include <algorithm>
#include <optional>
#include <string_view>
#include <utility>
#include <vector>

namespace cli {
namespace {

std::string pathWithKey(const std::string& className, const std::string& key, std::string_view value) {
  std::string path(cimNamespace);
  path.append(":").append(className).append(".").append(key).append("=\"");
  for (const char c : value) {
    path.append(c == '"' || c == '\\' ? "\\" : "").push_back(c);
  }
  return path + '"';
}

/// What stands between the namespace and the keys.
std::string classOf(std::string_view path) {
  const std::string_view beforeKeys = path.substr(0, path.find('='));
  const std::size_t begin = beforeKeys.rfind(':') + 1;  // 0 where there is no namespace
  return std::string(beforeKeys.substr(begin, beforeKeys.find('.', begin) - begin));
}

/// CLASS and VALUE of CLASS=VALUE. In a path, a key stands between the class and the first "=".
std::optional<std::pair<std::string, std::string>> classAndValue(const std::string& typed) {
  const std::size_t equals = typed.find('=');
  if (typed.find_first_of(".:/") < equals) {
    return std::nullopt;
  }
  return std::pair(typed.substr(0, equals), typed.substr(equals + 1));
}

/// The paths of all objects of the class whose key has the value.
std::vector<std::string> pathsWith(Session& session, const cimom::SchemaClass& info, const std::string& key,
                                   const std::string& value, const std::string& what) {
  std::vector<std::string> paths;
  const cimom::Outcome outcome =
      session.manager().enumerateInstanceNames(cimNamespace, info.name(), [&](const cimom::ObjectPath& path) {
        const cimom::NamedValue* found = path.find(key);
        if (found != nullptr && cimom::text(found->data) == value) {
          paths.push_back(cimom::formatWbemUri(path));
        }
        return true;
      });
  session.throwIfFailed(outcome, what);
  return paths;
}

std::string pathOf(Session& session, const cimom::SchemaClass& info, const std::string& value,
                   const std::string& what) {
  const cimom::mof::Property* key = tellingKey(info);
  if (key == nullptr) {
    throw CommandError(statusName(CMPI_RC_ERR_INVALID_PARAMETER) + ": " + what +
                       ": one value does not tell " + info.name() +
                       " objects apart; give a path as 'swinv names " + info.name() + "' prints it");
  }
  if (info.keys().size() == 1) {
    return pathWithKey(info.name(), key->name, value);
  }
  const std::vector<std::string> paths = pathsWith(session, info, key->name, value, what);
  if (paths.empty()) {
    throw CommandError(statusName(CMPI_RC_ERR_NOT_FOUND) + ": " + what + ": no " + info.name() + " has the " +
                       key->name + " '" + value + "'\n'swinv names " + info.name() +
                       "' shows what there is.");
  }
  if (paths.size() > 1) {
    std::string message = statusName(CMPI_RC_ERR_INVALID_PARAMETER) + ": " + what + ": " +
                          std::to_string(paths.size()) + " objects have this " + key->name +
                          "; give the path of one:";
    for (const std::string& path : paths) {
      message.append("\n").append(path);
    }
    throw CommandError(message);
  }
  return paths.front();
}

}  // namespace

NamedObject namedObject(Session& session, const std::string& typed, const std::string& what) {
  // An InstanceID holds no "=".
  if (typed.find('=') == std::string::npos) {
    const cimom::SchemaClass& info = session.classNamed(std::string(softwareClass));
    return {pathWithKey(info.name(), "InstanceID", typed), &info};
  }
  if (const auto brief = classAndValue(typed)) {
    const cimom::SchemaClass& info = session.classNamed(brief->first);
    return {pathOf(session, info, brief->second, what), &info};
  }
  return {typed, &session.classNamed(classOf(typed))};
}

}  // namespace cli
