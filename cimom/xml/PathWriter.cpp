#include <cimom/xml/PathWriter.h>
#include <cimom/xml/Text.h>
#include <cimom/xml/Types.h>
#include <cimom/xml/ValueWriter.h>

namespace cimom::xml {

namespace {

std::string_view valueTypeOf(CMPIType type) {
  if (type == CMPI_boolean)
    return "boolean";
  const bool isNumber = (type & (CMPI_UINT | CMPI_REAL)) != 0 && type < CMPI_ENC;
  return isNumber ? "numeric" : "string";
}

void appendLocalNameSpacePath(std::string& out, std::string_view nameSpace) {
  out += "<LOCALNAMESPACEPATH>";
  while (true) {
    const std::size_t end = nameSpace.find('/');
    out += "<NAMESPACE";
    appendAttribute(out, "NAME", nameSpace.substr(0, end));
    out += "/>";
    if (end == std::string_view::npos)
      break;
    nameSpace.remove_prefix(end + 1);
  }
  out += "</LOCALNAMESPACEPATH>";
}

void appendNameSpacePath(std::string& out, std::string_view host, std::string_view nameSpace) {
  out += "<NAMESPACEPATH><HOST>";
  appendText(out, host);
  out += "</HOST>";
  appendLocalNameSpacePath(out, nameSpace);
  out += "</NAMESPACEPATH>";
}

}  // namespace

PathWriter::PathWriter(PathForm form, Location location) : PathWriter(form, std::move(location), 0) {}

PathWriter::PathWriter(PathForm form, Location location, unsigned depth)
    : form_(form), location_(std::move(location)), depth_(depth) {}

void PathWriter::append(std::string& out, const ObjectPath& path) {
  if (!isPlanned_ || path.className() != className_ || path.nameSpace() != nameSpace_ ||
      path.hostName() != host_)
    plan(path);
  out += open_;
  if (depth_ < referenceDepth) {
    std::size_t position = 0;
    for (const NamedValue& key : path.keys())
      appendKey(out, key, position++);
  }
  out += close_;
}

void PathWriter::plan(const ObjectPath& path) {
  className_ = path.className();
  host_ = path.hostName();
  nameSpace_ = path.nameSpace();
  keys_.clear();
  open_.clear();
  close_ = "</INSTANCENAME>";
  planPlace();
  open_ += "<INSTANCENAME";
  appendAttribute(open_, "CLASSNAME", className_);
  open_ += '>';
  isPlanned_ = true;
}

// What stands around the instance name.
void PathWriter::planPlace() {
  if (form_ == PathForm::instanceName)
    return;
  const std::string_view nameSpace = nameSpace_.empty() ? location_.nameSpace : nameSpace_;
  if (form_ == PathForm::objectPath)
    open_ += "<OBJECTPATH>";
  if (form_ == PathForm::valueReference)
    open_ += "<VALUE.REFERENCE>";
  if (form_ != PathForm::valueReference || !host_.empty()) {
    open_ += "<INSTANCEPATH>";
    appendNameSpacePath(open_, host_.empty() ? location_.host : host_, nameSpace);
    close_ += "</INSTANCEPATH>";
  } else if (!nameSpace.empty()) {
    open_ += "<LOCALINSTANCEPATH>";
    appendLocalNameSpacePath(open_, nameSpace);
    close_ += "</LOCALINSTANCEPATH>";
  }
  if (form_ == PathForm::objectPath)
    close_ += "</OBJECTPATH>";
  if (form_ == PathForm::valueReference)
    close_ += "</VALUE.REFERENCE>";
}

// Paths of a class have the same keys in the same places, as a rule; where one has not, the place's plan is
// made anew.
PathWriter::KeyPlan& PathWriter::planFor(const NamedValue& key, std::size_t position) {
  if (position == keys_.size())
    keys_.emplace_back();
  KeyPlan& plan = keys_[position];
  if (plan.type == key.data.type && plan.name == key.name)
    return plan;
  plan.name = key.name;
  plan.type = key.data.type;
  plan.open = "<KEYBINDING";
  appendAttribute(plan.open, "NAME", key.name);
  plan.open += '>';
  if (plan.type == CMPI_ref) {
    plan.reference.reset(new PathWriter(PathForm::valueReference, location_, depth_ + 1));
  } else {
    plan.open += "<KEYVALUE";
    appendAttribute(plan.open, "VALUETYPE", valueTypeOf(plan.type));
    appendAttribute(plan.open, "TYPE", typeName(plan.type));
    plan.open += '>';
  }
  return plan;
}

void PathWriter::appendKey(std::string& out, const NamedValue& key, std::size_t position) {
  KeyPlan& plan = planFor(key, position);
  out += plan.open;
  if (const ObjectPath* const reference = objectPath(key.data); reference != nullptr) {
    plan.reference->append(out, *reference);
    out += "</KEYBINDING>";
    return;
  }
  appendValueText(out, key.data);
  out += "</KEYVALUE></KEYBINDING>";
}

void appendClassName(std::string& out, std::string_view className) {
  out += "<CLASSNAME";
  appendAttribute(out, "NAME", className);
  out += "/>";
}

void appendClassPath(std::string& out, std::string_view className, const Location& location) {
  out += "<CLASSPATH>";
  appendNameSpacePath(out, location.host, location.nameSpace);
  appendClassName(out, className);
  out += "</CLASSPATH>";
}

void appendClassObjectPath(std::string& out, std::string_view className, const Location& location) {
  out += "<OBJECTPATH>";
  appendClassPath(out, className, location);
  out += "</OBJECTPATH>";
}

}  // namespace cimom::xml
