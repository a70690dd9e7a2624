// The objects that commands are given, as people type them.
#pragma once

#include <cli/Session.h>

#include <string>

namespace cli {

/// An object whose class the schema has.
struct NamedObject {
  std::string path;  ///< a WBEM URI, with or without the namespace
  const cimom::SchemaClass* info = nullptr;
};

/// The object that `typed` names: an InstanceID, CLASS=VALUE with the one key that tells objects of the class
/// apart, or a WBEM URI. For CLASS=VALUE the objects of the class may be asked for. `what` says in messages
/// what was asked for ("get 1@3b2"). Throws `CommandError` for an unknown class, and where CLASS=VALUE names
/// no object or several.
NamedObject namedObject(Session& session, const std::string& typed, const std::string& what);

}  // namespace cli
