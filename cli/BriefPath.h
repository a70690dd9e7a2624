// Object paths in the short form that tables show and commands take.
//
//   1@3b2                              a software identity: its InstanceID
//   KELVO_NetworkPort=0000:3b:00.0/1   any object whose class has one key that tells it from others
#pragma once

#include <cimom/broker/Objects.h>
#include <cimom/mof/ClassRepository.h>

#include <string>
#include <string_view>

namespace cli {

/// The class whose objects are named by their InstanceIDs alone.
inline constexpr std::string_view softwareClass = "KELVO_SoftwareIdentity";

/// Whether a key only repeats the name of a class: CreationClassName, SystemCreationClassName.
bool namesAClass(std::string_view key);

/// Whether a key tells which system an object is part of: SystemName.
bool namesASystem(std::string_view key);

/// The one text key that tells objects of a class from others on the same system; nullptr where there is none
/// or several.
const cimom::mof::Property* tellingKey(const cimom::SchemaClass& info);

/// The short form of a path; empty where it has none.
std::string briefPath(const cimom::ObjectPath& path);

}  // namespace cli
