#include <cli/CimStatus.h>
#include <cli/HostedManager.h>
#include <cli/Messages.h>
#include <cli/Session.h>
#include <cli/Source.h>
#include <cli/Text.h>

#include <algorithm>
#include <vector>

namespace cli {
namespace {

/// What to do about a failure that has no description: a provider's status carries none.
std::string hintFor(const cimom::Status& status, bool logs) {
  if (status.code == CMPI_RC_ERR_NOT_FOUND) {
    return "\n'swinv names' shows what there is.";
  }
  return status.description.empty() && !logs ? "\n--log-level error shows what the provider has to say." : "";
}

/// This system's own classes; the rest of the schema is what they derive from.
bool isOwn(const cimom::SchemaClass& info) {
  return !info.name().starts_with("CIM_");
}

std::string ownClasses(const cimom::ClassRepository& classes) {
  std::string names;
  for (const cimom::SchemaClass* each : classes.all()) {
    if (isOwn(*each)) {
      names.append(names.empty() ? "" : ", ").append(each->name());
    }
  }
  return names;
}

}  // namespace

Session::Session(const Options& options)
    : source_(checkedSource()),
      logs_(options.logLevel.value_or(LogLevel::Off) != LogLevel::Off),
      manager_(makeManager(options)) {}

const cimom::SchemaClass& Session::classNamed(const std::string& name) const {
  const cimom::SchemaClass* info = manager_->classes().find(name);
  if (info != nullptr) {
    return *info;
  }
  std::vector<std::string> known;
  for (const cimom::SchemaClass* other : manager_->classes().all()) {
    known.push_back(other->name());
  }
  const auto nearest = nearestName(name, known);
  throw CommandError(
      statusName(CMPI_RC_ERR_INVALID_CLASS) + ": the schema has no class '" + name + "'" +
      (nearest ? "; did you mean " + *nearest + "?" : "; try " + ownClasses(manager_->classes())));
}

std::vector<const cimom::SchemaClass*> Session::publishedClasses(const cimom::SchemaClass* top) const {
  std::vector<const cimom::SchemaClass*> classes;
  for (const cimom::SchemaClass* each : manager_->classes().all()) {
    if (isOwn(*each) && !each->isAssociation() && (top == nullptr || each->isA(*top))) {
      classes.push_back(each);
    }
  }
  if (classes.empty() && top != nullptr) {
    classes.push_back(top);
  }
  return classes;
}

void Session::throwIfFailed(const cimom::Outcome& outcome, const std::string& what) const {
  const std::string& description = outcome.status.description;
  if (outcome.status.code != CMPI_RC_OK) {
    throw CommandError(statusName(outcome.status.code) + ": " + what +
                       (description.empty() ? "" : ": " + description) + hintFor(outcome.status, logs_));
  }
}

void Session::conclude(const cimom::Outcome& outcome, const std::string& what, Document& document,
                       Output& output) const {
  if (!outcome.done && outcome.delivered == 0 && source_.inventory) {
    // A provider cannot say why the framework had nothing for it; the file itself can.
    static_cast<void>(readTreeOf(source_));
  }
  if (outcome.status.code == CMPI_RC_OK || outcome.delivered > 0) {
    document.finish();
    output.flush();
  }
  throwIfFailed(outcome, what);
  if (!outcome.done) {
    complain(logs_ ? "the provider stopped early; its log above says why"
                   : "the provider stopped early; --log-level error shows why");
  }
}

}  // namespace cli
