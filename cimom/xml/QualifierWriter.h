// Qualifiers of classes and their features.
#pragma once

#include <cimom/mof/ClassRepository.h>
#include <cimom/mof/Declarations.h>

#include <string>
#include <string_view>

namespace cimom::xml {

/// QUALIFIER elements: those in effect, or `own` alone with `localOnly`. `own` is what the element itself
/// declares; the others are propagated. It may be null: nothing of its own.
void appendQualifiers(std::string& out, const ClassRepository& classes, const mof::Qualifiers& inEffect,
                      const mof::Qualifiers* own, bool localOnly);

/// The EmbeddedObject attribute, where the qualifiers say that a text is an object.
void appendEmbedded(std::string& out, const mof::Qualifiers& qualifiers);

/// The property of this name that the class itself declares, or nullptr.
[[nodiscard]] const mof::Property* ownProperty(const SchemaClass& which, std::string_view name);

}  // namespace cimom::xml
