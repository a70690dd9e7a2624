// The host's objects as rows.
#pragma once

#include <cimom/broker/Objects.h>
#include <cimom/mof/ClassRepository.h>
#include <cli/Options.h>
#include <cli/Row.h>

#include <optional>
#include <string>
#include <vector>

namespace cli {

/// A column for each property of the class, in the order of the MOF.
Columns allColumns(const cimom::SchemaClass& info);

/// The named properties, each once, in the order given. Throws `CommandError` (CIM_ERR_NO_SUCH_PROPERTY) for
/// a name that all of the classes lack.
Columns namedColumns(const std::vector<const cimom::SchemaClass*>& classes,
                     const std::vector<std::string>& names);

/// Those of the columns whose properties the class has, in the order of its MOF, in which members of JSON
/// objects stand whatever was asked for first.
Columns columnsIn(const cimom::SchemaClass& info, Columns columns);

/// What a table shows unless told otherwise: of a software identity what tells it apart, of any other class
/// its keys first, without those that repeat the names of classes, then the rest.
Columns tellingColumns(const cimom::SchemaClass& info);

/// The object's path, under a name that no property can have: "@path".
Column pathColumn();

/// The path, then the keys.
Columns nameColumns(const cimom::SchemaClass& info);

/// The columns that the options ask for, or those that suit their format.
Columns chosenColumns(const cimom::SchemaClass& info, const Options& options);

/// The properties that the host is asked for: those of the columns, or none named where that is all of them.
std::optional<std::vector<std::string>> wantedProperties(const cimom::SchemaClass& info,
                                                         const Columns& columns);

/// Properties that were not set, or set to null, are null.
Row rowOf(const cimom::Instance& instance, const Columns& columns);

/// Of a path: itself and its keys.
Row rowOf(const cimom::ObjectPath& path, const Columns& columns);

}  // namespace cli
