#include <cimom/Names.h>
#include <cimom/xml/InstancePlan.h>
#include <cimom/xml/QualifierWriter.h>
#include <cimom/xml/Types.h>
#include <cimom/xml/ValueWriter.h>

#include <algorithm>

namespace cimom::xml {

namespace {

class Planner {
 public:
  Planner(const ClassInfo& info, const ClassRepository& classes, const InstanceOptions& options)
      : info_(info), classes_(classes), options_(options), schema_(classes.find(info.name())) {}

  InstancePlan make() {
    plan_.open = "<INSTANCE";
    appendAttribute(plan_.open, "CLASSNAME", info_.name());
    plan_.open += '>';
    if (options_.includeQualifiers && schema_ != nullptr)
      appendQualifiers(plan_.open, classes_, schema_->qualifiers, &schema_->declared.qualifiers, false);
    for (const PropertyInfo& property : info_.properties())
      if (isShown(property))
        add(property);
    return std::move(plan_);
  }

 private:
  [[nodiscard]] bool isShown(const PropertyInfo& property) const {
    if (property.type == (CMPI_ref | CMPI_ARRAY))
      return false;  // CIM has no such properties, and the document type no element for them
    if (options_.properties) {
      const auto& names = *options_.properties;
      if (std::none_of(names.begin(), names.end(),
                       [&](const std::string& name) { return sameName(name, property.name); }))
        return false;
    }
    const bool isLimited = !options_.deepInheritance && options_.requested != nullptr;
    if (isLimited && options_.requested->property(property.name) == nullptr)
      return false;
    return !options_.localOnly || isLocal(property.name, isLimited);
  }

  [[nodiscard]] bool isLocal(std::string_view name, bool isLimited) const {
    const SchemaClass* which = isLimited ? options_.requested : schema_;
    const SchemaClass* last = which;
    if (which != nullptr && options_.requested != nullptr && which->isA(*options_.requested))
      last = options_.requested;
    for (; which != nullptr; which = which->superclass) {
      if (ownProperty(*which, name) != nullptr)
        return true;
      if (which == last)
        return false;
    }
    return false;
  }

  void add(const PropertyInfo& property) {
    const mof::Property* const declared = schema_ == nullptr ? nullptr : schema_->property(property.name);
    PropertyPlan item;
    item.index = property.index;
    item.type = property.type;
    item.open = openTag(property, declared);
    if (options_.includeQualifiers && declared != nullptr) {
      const mof::Property* const own = ownProperty(*schema_, property.name);
      appendQualifiers(item.open, classes_, declared->qualifiers, own == nullptr ? nullptr : &own->qualifiers,
                       false);
    }
    item.nullBegin = plan_.nulls.size();
    // With an end tag of its own: Debian's wbemcli does not read "<PROPERTY .../>".
    item.close = closeTag(property);
    plan_.nulls.append(item.open).append(item.close);
    item.nullEnd = plan_.nulls.size();
    if (property.type == CMPI_ref) {
      item.reference = std::make_unique<PathWriter>(PathForm::valueReference, options_.location);
    } else if ((property.type & CMPI_ARRAY) == 0) {
      item.open += "<VALUE>";
      item.close = "</VALUE></PROPERTY>";
    }
    plan_.properties.push_back(std::move(item));
  }

  static std::string_view closeTag(const PropertyInfo& property) {
    if (property.type == CMPI_ref)
      return "</PROPERTY.REFERENCE>";
    return (property.type & CMPI_ARRAY) != 0 ? "</PROPERTY.ARRAY>" : "</PROPERTY>";
  }

  [[nodiscard]] std::string openTag(const PropertyInfo& property, const mof::Property* declared) const {
    std::string tag;
    if (property.type == CMPI_ref) {
      tag = "<PROPERTY.REFERENCE";
      appendAttribute(tag, "NAME", property.name);
      if (declared != nullptr)
        appendAttribute(tag, "REFERENCECLASS", declared->referenceClass);
    } else {
      tag = (property.type & CMPI_ARRAY) != 0 ? "<PROPERTY.ARRAY" : "<PROPERTY";
      appendAttribute(tag, "NAME", property.name);
      appendAttribute(tag, "TYPE", typeName(property.type));
    }
    if (options_.includeClassOrigin && declared != nullptr)
      appendAttribute(tag, "CLASSORIGIN", declared->origin);
    if ((property.type & ~CMPI_ARRAY) == CMPI_instance)
      tag += " EmbeddedObject=\"instance\"";
    else if (declared != nullptr && property.type != CMPI_ref)
      appendEmbedded(tag, declared->qualifiers);
    return tag + '>';
  }

  const ClassInfo& info_;
  const ClassRepository& classes_;
  const InstanceOptions& options_;
  const SchemaClass* schema_;
  InstancePlan plan_;
};

}  // namespace

InstancePlan makePlan(const ClassInfo& info, const ClassRepository& classes, const InstanceOptions& options) {
  return Planner(info, classes, options).make();
}

}  // namespace cimom::xml
