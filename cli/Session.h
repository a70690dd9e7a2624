// A CIM object manager of this process's own, and requests to it.
#pragma once

#include <agent/framework/TreeSource.h>
#include <cimom/ObjectManager.h>
#include <cli/Options.h>
#include <cli/Output.h>
#include <cli/RowWriter.h>

#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace cli {

/// The namespace of everything that swinv asks for.
inline constexpr std::string_view cimNamespace = "root/cimv2";

class Session {
 public:
  /// Checks the source, then reads schema and registrations. Throws `CommandError`.
  explicit Session(const Options& options);

  [[nodiscard]] cimom::ObjectManager& manager() const { return *manager_; }

  /// Throws `CommandError` (CIM_ERR_INVALID_CLASS) for a class that the schema lacks.
  [[nodiscard]] const cimom::SchemaClass& classNamed(const std::string& name) const;

  /// What the schema publishes of this system's own: its classes that are no associations, at or below `top`
  /// where one is given. Where there are none below it, `top` itself.
  [[nodiscard]] std::vector<const cimom::SchemaClass*> publishedClasses(const cimom::SchemaClass* top) const;

  /// Throws `CommandError` where the outcome is a failure; `what` as below.
  void throwIfFailed(const cimom::Outcome& outcome, const std::string& what) const;

  /// Ends a request: finishes the document, and throws `CommandError` where the request failed or the
  /// inventory file turns out to be the reason for an empty answer. A provider that stopped early is told of
  /// on standard error. `what` says in messages what was asked for ("list KELVO_SoftwareIdentity").
  void conclude(const cimom::Outcome& outcome, const std::string& what, Document& document,
                Output& output) const;

 private:
  agent::TreeSource source_;
  bool logs_;  ///< the provider's log is on
  std::unique_ptr<cimom::ObjectManager> manager_;
};

}  // namespace cli
