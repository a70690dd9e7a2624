#include <cimom/Names.h>
#include <cimom/xml/QualifierWriter.h>
#include <cimom/xml/Types.h>
#include <cimom/xml/ValueWriter.h>

#include <algorithm>

namespace cimom::xml {

namespace {

bool hasFlavor(const mof::QualifierDeclaration& declaration, std::string_view flavor) {
  return std::any_of(declaration.flavors.begin(), declaration.flavors.end(),
                     [flavor](const std::string& each) { return sameName(each, flavor); });
}

// Flavors other than what the document type takes for granted.
void appendFlavors(std::string& out, const mof::QualifierDeclaration& declaration) {
  if (hasFlavor(declaration, "DisableOverride"))
    out += " OVERRIDABLE=\"false\"";
  if (!declaration.toSubclass())
    out += " TOSUBCLASS=\"false\"";
  if (hasFlavor(declaration, "Translatable"))
    out += " TRANSLATABLE=\"true\"";
}

void appendQualifier(std::string& out, const mof::Qualifier& qualifier,
                     const mof::QualifierDeclaration& declaration, bool isPropagated) {
  out += "<QUALIFIER";
  appendAttribute(out, "NAME", declaration.name);
  appendAttribute(out, "TYPE", typeName(declaration.type));
  if (isPropagated)
    out += " PROPAGATED=\"true\"";
  appendFlavors(out, declaration);
  out += '>';
  appendMofValue(out, qualifier.value, declaration.type);
  out += "</QUALIFIER>";
}

}  // namespace

void appendQualifiers(std::string& out, const ClassRepository& classes, const mof::Qualifiers& inEffect,
                      const mof::Qualifiers* own, bool localOnly) {
  for (const mof::Qualifier& qualifier : inEffect) {
    const bool isOwn = own != nullptr && mof::findQualifier(*own, qualifier.name) != nullptr;
    const mof::QualifierDeclaration* const declaration = classes.qualifier(qualifier.name);
    if (declaration != nullptr && (isOwn || !localOnly))
      appendQualifier(out, qualifier, *declaration, !isOwn);
  }
}

void appendEmbedded(std::string& out, const mof::Qualifiers& qualifiers) {
  if (mof::isTrue(qualifiers, "EmbeddedObject"))
    out += " EmbeddedObject=\"object\"";
  else if (!mof::textOf(qualifiers, "EmbeddedInstance").empty())
    out += " EmbeddedObject=\"instance\"";
}

const mof::Property* ownProperty(const SchemaClass& which, std::string_view name) {
  const auto& all = which.declared.properties;
  const auto found =
      std::find_if(all.begin(), all.end(), [&](const auto& each) { return sameName(each.name, name); });
  return found == all.end() ? nullptr : &*found;
}

}  // namespace cimom::xml
