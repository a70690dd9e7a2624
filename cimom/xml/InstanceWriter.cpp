#include <cimom/xml/InstancePlan.h>
#include <cimom/xml/InstanceWriter.h>
#include <cimom/xml/Text.h>
#include <cimom/xml/ValueWriter.h>

#include <string_view>
#include <utility>

namespace cimom::xml {

namespace {

PathForm pathFormOf(InstanceForm form) {
  return form == InstanceForm::namedInstance ? PathForm::instanceName : PathForm::instancePath;
}

// The tags around the path, where the form has one, and the instance.
std::pair<std::string_view, std::string_view> tagsOf(InstanceForm form) {
  switch (form) {
    case InstanceForm::namedInstance:
      return {"<VALUE.NAMEDINSTANCE>", "</INSTANCE></VALUE.NAMEDINSTANCE>"};
    case InstanceForm::instanceWithPath:
      return {"<VALUE.INSTANCEWITHPATH>", "</INSTANCE></VALUE.INSTANCEWITHPATH>"};
    case InstanceForm::objectWithPath:
      return {"<VALUE.OBJECTWITHPATH>", "</INSTANCE></VALUE.OBJECTWITHPATH>"};
    case InstanceForm::object:
      return {"<VALUE.OBJECT>", "</INSTANCE></VALUE.OBJECT>"};
    case InstanceForm::instance:
      break;
  }
  return {"", "</INSTANCE>"};
}

bool hasPath(InstanceForm form) {
  return form != InstanceForm::instance && form != InstanceForm::object;
}

bool isInstanceType(CMPIType type) {
  return (type & ~CMPI_ARRAY) == CMPI_instance;
}

}  // namespace

struct InstanceWriter::Plan : InstancePlan {};

InstanceWriter::InstanceWriter(const ClassRepository& classes, InstanceOptions options)
    : InstanceWriter(classes, std::move(options), 0) {}

InstanceWriter::InstanceWriter(const ClassRepository& classes, InstanceOptions options, unsigned depth)
    : classes_(classes),
      options_(std::move(options)),
      path_(pathFormOf(options_.form), options_.location),
      depth_(depth) {}

InstanceWriter::~InstanceWriter() = default;

InstanceWriter::Plan& InstanceWriter::planOf(const ClassInfo& info) {
  if (lastClass_ == &info)
    return *lastPlan_;
  std::unique_ptr<Plan>& plan = plans_[&info];
  if (plan == nullptr)
    plan = std::make_unique<Plan>(Plan{makePlan(info, classes_, options_)});
  lastClass_ = &info;
  lastPlan_ = plan.get();
  return *plan;
}

void InstanceWriter::append(std::string& out, const Instance& instance) {
  const auto [open, close] = tagsOf(options_.form);
  out += open;
  if (hasPath(options_.form))
    path_.append(out, instance.path());
  appendInstance(out, instance);
  out += close;
}

void InstanceWriter::appendInstance(std::string& out, const Instance& instance) {
  Plan& plan = planOf(instance.classInfo());
  out += plan.open;
  std::size_t nullBegin = 0;  // of nulls that are still to be written
  for (PropertyPlan& property : plan.properties) {
    const NamedValue* const value = instance.at(property.index);
    if (value == nullptr || isNull(value->data))
      continue;
    if (property.nullBegin > nullBegin)
      out.append(plan.nulls, nullBegin, property.nullBegin - nullBegin);
    nullBegin = property.nullEnd;
    out += property.open;
    if (isInstanceType(property.type))
      appendEmbeddedValue(out, value->data);
    else if (property.reference != nullptr) {
      if (const ObjectPath* const path = objectPath(value->data); path != nullptr)
        property.reference->append(out, *path);
    } else if ((property.type & CMPI_ARRAY) != 0)
      appendValueArray(out, value->data);
    else
      appendValueText(out, value->data);
    out += property.close;
  }
  out.append(plan.nulls, nullBegin);
}

// The text of a VALUE that is an instance in XML.
void InstanceWriter::appendEmbeddedText(std::string& out, const Instance& instance) {
  if (depth_ == embeddingDepth)
    return;
  if (embedded_ == nullptr) {
    InstanceOptions options;
    options.form = InstanceForm::instance;
    options.location = options_.location;
    embedded_.reset(new InstanceWriter(classes_, std::move(options), depth_ + 1));
  }
  std::string text;
  embedded_->append(text, instance);
  appendText(out, text);
}

void InstanceWriter::appendEmbeddedValue(std::string& out, const CMPIData& data) {
  if (const Instance* const single = cimom::instance(data); single != nullptr)
    return appendEmbeddedText(out, *single);
  if ((data.type & CMPI_ARRAY) == 0)
    return;
  out += "<VALUE.ARRAY>";
  for (const CMPIData& element : elements(data)) {
    const Instance* const embedded = cimom::instance(element);
    out += embedded == nullptr ? "<VALUE.NULL/>" : "<VALUE>";
    if (embedded != nullptr) {
      appendEmbeddedText(out, *embedded);
      out += "</VALUE>";
    }
  }
  out += "</VALUE.ARRAY>";
}

}  // namespace cimom::xml
