#include <agent/discovery/Source.h>
#include <agent/discovery/SourceBoard.h>
#include <agent/discovery/Values.h>

#include <cerrno>
#include <system_error>
#include <utility>

namespace agent::discovery {

SourceReport::Reason reasonOf(int error) {
  switch (error) {
    case ENOENT:
    case ENOTDIR:
    case ENODEV:
    case ENXIO:
      return SourceReport::Reason::Absent;
    case EACCES:
    case EPERM:
      return SourceReport::Reason::NoPermission;
    case ETIMEDOUT:
      return SourceReport::Reason::TimedOut;
    default:
      return SourceReport::Reason::Unreadable;
  }
}

std::string errorText(int error) {
  return std::generic_category().message(error);
}

SourceContext::SourceContext(std::string source, SystemRoot root, std::shared_ptr<SourceBoard> board)
    : source_(std::move(source)), root_(std::move(root)), board_(std::move(board)) {}

std::optional<std::string> SourceContext::text(const std::string& path) {
  doing(root_.outside(path));
  const Outcome<std::string> content = root_.read(path);
  if (!content) {
    reportError(root_.outside(path), content.error);
    return std::nullopt;
  }
  std::optional<std::string> meant = meaningful(*content.value);
  if (!meant) {
    report(root_.outside(path), SourceReport::Reason::Absent,
           "it says nothing: \"" + cleanText(*content.value) + "\"");
  }
  return meant;
}

std::optional<std::string> SourceContext::textIfAny(const std::string& path) {
  doing(root_.outside(path));
  const Outcome<std::string> content = root_.read(path);
  if (content) {
    return meaningful(*content.value);
  }
  // Network drivers answer EOPNOTSUPP for an attribute that they have no value for.
  if (reasonOf(content.error) != SourceReport::Reason::Absent && content.error != EOPNOTSUPP) {
    reportError(root_.outside(path), content.error);
  }
  return std::nullopt;
}

std::vector<std::string> SourceContext::list(const std::string& path) {
  doing(root_.outside(path));
  Outcome<std::vector<std::string>> names = root_.list(path);
  if (!names) {
    reportError(root_.outside(path), names.error);
    return {};
  }
  return std::move(*names.value);
}

std::vector<std::string> SourceContext::listIfAny(const std::string& path) {
  doing(root_.outside(path));
  Outcome<std::vector<std::string>> names = root_.list(path);
  if (names) {
    return std::move(*names.value);
  }
  if (reasonOf(names.error) != SourceReport::Reason::Absent) {
    reportError(root_.outside(path), names.error);
  }
  return {};
}

void SourceContext::doing(const std::string& what) {
  board_->doing(what);
}

void SourceContext::reportError(const std::string& path, int error) {
  report(path, reasonOf(error), errorText(error));
}

void SourceContext::report(const std::string& path, SourceReport::Reason reason, const std::string& detail) {
  std::vector<SourceReport>& reports = result_.reports;
  if (reports.size() < reportLimit) {
    reports.push_back({source_, cleanText(path), reason, cleanText(detail)});
    return;
  }
  if (unsaid_ == 0) {
    reports.push_back({source_, "", SourceReport::Reason::Unreadable, ""});
  }
  reports.back().detail = std::to_string(++unsaid_) + " more that could not be read";
}

void SourceContext::publish() {
  board_->publish(result_, false);
}

}  // namespace agent::discovery
