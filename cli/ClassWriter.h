// Objects of several classes in one document.
#pragma once

#include <cimom/mof/ClassRepository.h>
#include <cli/Options.h>
#include <cli/Output.h>
#include <cli/RowWriter.h>

#include <memory>
#include <vector>

namespace cli {

/// Takes rows as they come, each with the columns of its object's class.
class ClassWriter : public Document {
 public:
  /// The columns that rows of this class have. They stay where they are as long as the writer.
  virtual const Columns& columnsOf(const cimom::SchemaClass& info) = 0;
  virtual void write(const cimom::SchemaClass& info, Row row) = 0;
};

/// A writer for the answer of an association: of instances, or of paths (`namesOnly`).
///
///   table  a table for each class in the order in which they come, under the name of the class where there
///          are several; one table for all where properties were asked for
///   json   one list, of each object its path and its properties
///   csv    the path, then every property that an object of `classes` may have, each name once
///   names  as `swinv names`
///
/// Throws `CommandError` (CIM_ERR_NO_SUCH_PROPERTY) for a property that none of `classes` has. The output
/// must outlive the writer, the classes too.
std::unique_ptr<ClassWriter> makeClassWriter(const std::vector<const cimom::SchemaClass*>& classes,
                                             const Options& options, Output& output);

}  // namespace cli
