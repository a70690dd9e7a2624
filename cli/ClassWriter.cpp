#include <cli/BriefPath.h>
#include <cli/CimRows.h>
#include <cli/ClassWriter.h>
#include <cli/JsonOutput.h>
#include <cli/Writers.h>

#include <algorithm>
#include <functional>
#include <map>
#include <utility>

namespace cli {
namespace {

using Classes = std::vector<const cimom::SchemaClass*>;
using ColumnChoice = std::function<Columns(const cimom::SchemaClass&)>;

/// All objects as rows of the same columns.
class CommonColumns : public ClassWriter {
 public:
  CommonColumns(Columns columns, std::unique_ptr<RowWriter> rows)
      : columns_(std::move(columns)), rows_(std::move(rows)) {}

  const Columns& columnsOf(const cimom::SchemaClass&) override { return columns_; }
  void write(const cimom::SchemaClass&, Row row) override { rows_->write(std::move(row)); }
  void finish() override { rows_->finish(); }

 private:
  Columns columns_;
  std::unique_ptr<RowWriter> rows_;
};

/// What is common to the writers that have columns for each class.
class OwnColumns : public ClassWriter {
 public:
  explicit OwnColumns(ColumnChoice choice) : choice_(std::move(choice)) {}

  const Columns& columnsOf(const cimom::SchemaClass& info) override {
    const auto known = columns_.find(&info);
    return known == columns_.end() ? columns_.emplace(&info, choice_(info)).first->second : known->second;
  }

 private:
  ColumnChoice choice_;
  std::map<const cimom::SchemaClass*, Columns> columns_;
};

class JsonObjects : public OwnColumns {
 public:
  JsonObjects(ColumnChoice choice, Output& output) : OwnColumns(std::move(choice)), json_({}, output) {}

  void write(const cimom::SchemaClass& info, Row row) override {
    if (std::exchange(last_, &info) != &info) {
      json_.use(columnsOf(info));
    }
    json_.write(std::move(row));
  }
  void finish() override { json_.finish(); }

 private:
  const cimom::SchemaClass* last_ = nullptr;
  JsonOutput json_;
};

class TableForEachClass : public OwnColumns {
 public:
  TableForEachClass(ColumnChoice choice, Output& output) : OwnColumns(std::move(choice)), output_(output) {}

  void write(const cimom::SchemaClass& info, Row row) override {
    auto table = std::find_if(tables_.begin(), tables_.end(),
                              [&info](const auto& each) { return each.first == &info; });
    if (table == tables_.end()) {
      auto rows = makeWriter(Format::Table, columnsOf(info), {.dropEmptyColumns = true}, output_);
      table = tables_.emplace(tables_.end(), &info, std::move(rows));
    }
    table->second->write(std::move(row));
  }

  void finish() override {
    for (const auto& [info, rows] : tables_) {
      if (tables_.size() > 1) {
        output_.write((info == tables_.front().first ? "" : "\n") + info->name() + ":\n");
      }
      rows->finish();
    }
  }

 private:
  Output& output_;
  std::vector<std::pair<const cimom::SchemaClass*, std::unique_ptr<RowWriter>>> tables_;
};

/// Software is told apart by its InstanceID; of everything else the path stands first, in short, and says
/// what its keys say.
Columns tableColumns(const cimom::SchemaClass& info) {
  Columns columns = tellingColumns(info);
  if (info.name() != softwareClass) {
    std::erase_if(columns, [&info](const Column& column) { return info.property(column.name)->key; });
    columns.insert(columns.begin(), pathColumn());
  }
  return columns;
}

Columns withPath(Columns columns) {
  columns.insert(columns.begin(), pathColumn());
  return columns;
}

/// The columns that the choice makes for the classes, each name once.
Columns commonColumns(const Classes& classes, const ColumnChoice& choice) {
  Columns common;
  for (const cimom::SchemaClass* info : classes) {
    for (const Column& column : choice(*info)) {
      const bool known = std::any_of(common.begin(), common.end(),
                                     [&column](const Column& other) { return other.name == column.name; });
      if (!known) {
        common.push_back(column);
      }
    }
  }
  return common;
}

std::unique_ptr<ClassWriter> makeNames(const Classes& classes, const Options& options, Output& output) {
  if (options.format == Format::Json) {
    return std::make_unique<JsonObjects>(nameColumns, output);
  }
  Columns columns = commonColumns(classes, nameColumns);
  auto rows = makeNamesWriter(options.format, columns, output);
  return std::make_unique<CommonColumns>(std::move(columns), std::move(rows));
}

std::unique_ptr<ClassWriter> makeNamed(const Classes& classes, const Options& options, Output& output) {
  Columns columns = namedColumns(classes, options.properties);
  if (options.format == Format::Json) {
    return std::make_unique<JsonObjects>(
        [columns](const cimom::SchemaClass& info) { return columnsIn(info, columns); }, output);
  }
  auto rows = makeWriter(options.format, columns, {}, output);
  return std::make_unique<CommonColumns>(std::move(columns), std::move(rows));
}

}  // namespace

std::unique_ptr<ClassWriter> makeClassWriter(const Classes& classes, const Options& options, Output& output) {
  if (options.namesOnly) {
    return makeNames(classes, options, output);
  }
  if (!options.properties.empty()) {
    return makeNamed(classes, options, output);
  }
  const ColumnChoice all = [](const cimom::SchemaClass& info) { return withPath(allColumns(info)); };
  switch (options.format) {
    case Format::Json:
      return std::make_unique<JsonObjects>(all, output);
    case Format::Csv: {
      Columns columns = commonColumns(classes, all);
      auto rows = makeWriter(Format::Csv, columns, {}, output);
      return std::make_unique<CommonColumns>(std::move(columns), std::move(rows));
    }
    case Format::Table:
      break;
  }
  return std::make_unique<TableForEachClass>(tableColumns, output);
}

}  // namespace cli
