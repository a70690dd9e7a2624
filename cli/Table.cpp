#include <cli/DateText.h>
#include <cli/ScalarText.h>
#include <cli/Table.h>

#include <algorithm>
#include <numeric>
#include <utility>

namespace cli {
namespace {

constexpr std::size_t gap = 2;            // blanks between columns
constexpr std::size_t narrowest = 16;     // a column is not cut below this: versions are longer than words
constexpr std::size_t narrowestWrap = 8;  // nor a wrapped value in a block

/// "//host/root/cimv2:Class.Key=..." without what stands before the class name.
std::string_view shortReference(std::string_view uri) {
  const std::size_t colon = uri.substr(0, uri.find('"')).rfind(':');
  return colon == std::string_view::npos ? uri : uri.substr(colon + 1);
}

std::string textOf(const Scalar& value, const Column& column) {
  if (const auto* number = std::get_if<std::uint64_t>(&value)) {
    const auto name = column.valueNames.find(*number);
    return name == column.valueNames.end() ? std::to_string(*number) : name->second;
  }
  if (const auto* date = std::get_if<DateTime>(&value)) {
    return readableDate(date->text).value_or(date->text);
  }
  if (const auto* reference = std::get_if<Reference>(&value)) {
    return reference->brief.empty() ? std::string(shortReference(reference->uri)) : reference->brief;
  }
  return scalarText(value);
}

/// The widest that columns may be for `widths` to add up to `room`: the wide ones give first.
std::size_t commonLimit(const std::vector<std::size_t>& widths, std::size_t room) {
  std::vector<std::size_t> sorted = widths;
  std::sort(sorted.begin(), sorted.end());
  std::size_t left = room;
  for (std::size_t i = 0; i < sorted.size(); ++i) {
    const std::size_t share = left / (sorted.size() - i);
    if (sorted[i] > share) {
      return share;
    }
    left -= sorted[i];
  }
  return sorted.empty() ? 0 : sorted.back();
}

}  // namespace

std::string cellText(const Value& value, const Column& column, Charset charset) {
  std::string text;
  if (const Scalar* scalar = std::get_if<Scalar>(&value)) {
    text = textOf(*scalar, column);
  } else {
    for (const Scalar& element : std::get<std::vector<Scalar>>(value)) {
      text.append(text.empty() ? "" : ", ").append(textOf(element, column));
    }
  }
  return printable(text, charset);
}

Table::Table(Columns columns, TableStyle style, Output& output)
    : columns_(std::move(columns)), style_(style), output_(output) {}

void Table::write(Row row) {
  Cells cells;
  cells.reserve(columns_.size());
  for (std::size_t i = 0; i < columns_.size(); ++i) {
    cells.push_back(cellText(row[i], columns_[i], style_.charset));
  }
  rows_.push_back(std::move(cells));
}

void Table::finish() {
  if (rows_.empty()) {
    return;
  }
  const Layout layout = style_.records ? Layout{} : layOut();
  if (layout.columns.empty()) {
    printRecords();
    return;
  }
  Cells names;
  for (const Column& column : columns_) {
    names.push_back(column.name);
  }
  printLine(layout, names);
  for (const Cells& cells : rows_) {
    printLine(layout, cells);
  }
}

std::vector<std::size_t> Table::naturalWidths() const {
  std::vector<std::size_t> widths;
  for (std::size_t i = 0; i < columns_.size(); ++i) {
    std::size_t width = displayWidth(columns_[i].name);
    for (const Cells& cells : rows_) {
      width = std::max(width, displayWidth(cells[i]));
    }
    widths.push_back(width);
  }
  return widths;
}

std::vector<std::size_t> Table::shownColumns() const {
  std::vector<std::size_t> shown;
  for (std::size_t i = 0; i < columns_.size(); ++i) {
    const bool empty =
        std::all_of(rows_.begin(), rows_.end(), [i](const Cells& cells) { return cells[i].empty(); });
    if (!empty || !style_.dropEmptyColumns) {
      shown.push_back(i);
    }
  }
  return shown;
}

Table::Layout Table::layOut() const {
  const std::vector<std::size_t> natural = naturalWidths();
  std::vector<std::size_t> shown = shownColumns();
  while (!shown.empty()) {
    std::vector<std::size_t> flexible;
    std::size_t fixed = gap * (shown.size() - 1);
    for (const std::size_t i : shown) {
      if (columns_[i].whole) {
        fixed += natural[i];
      } else {
        flexible.push_back(natural[i]);
      }
    }
    const std::size_t wanted = std::accumulate(flexible.begin(), flexible.end(), fixed);
    std::size_t limit = wanted;
    if (style_.width != 0 && wanted > style_.width) {
      limit = style_.width > fixed ? commonLimit(flexible, style_.width - fixed) : 0;
    }
    if (limit >= narrowest || limit == wanted) {
      Layout layout{shown, {}};
      for (const std::size_t i : shown) {
        layout.widths.push_back(columns_[i].whole ? natural[i] : std::min(natural[i], limit));
      }
      return layout;
    }
    const auto drop = std::max_element(shown.begin(), shown.end(), [this](std::size_t a, std::size_t b) {
      return columns_[a].dropRank < columns_[b].dropRank;
    });
    if (columns_[*drop].dropRank == 0) {
      return {};
    }
    shown.erase(drop);
  }
  return {};
}

void Table::printLine(const Layout& layout, const Cells& cells) {
  std::string line;
  std::size_t blanks = 0;  // due before the next text: no line ends in blanks
  for (std::size_t i = 0; i < layout.columns.size(); ++i) {
    const std::string cell = cutToWidth(cells[layout.columns[i]], layout.widths[i], style_.charset);
    if (!cell.empty()) {
      line.append(blanks, ' ').append(cell);
      blanks = 0;
    }
    blanks += layout.widths[i] - displayWidth(cell) + gap;
  }
  output_.write(line.append("\n"));
}

void Table::printRecords() {
  std::size_t nameWidth = 0;
  for (std::size_t i = 0; i < columns_.size(); ++i) {
    const bool used =
        std::any_of(rows_.begin(), rows_.end(), [i](const Cells& cells) { return !cells[i].empty(); });
    nameWidth = used ? std::max(nameWidth, displayWidth(columns_[i].name)) : nameWidth;
  }
  const std::size_t indent = nameWidth + gap;
  const bool wrap = style_.width >= indent + narrowestWrap;
  bool first = true;
  for (const Cells& cells : rows_) {
    std::string block = first ? "" : "\n";
    first = false;
    for (std::size_t i = 0; i < columns_.size(); ++i) {
      if (cells[i].empty()) {
        continue;
      }
      const auto lines =
          wrap ? wrapToWidth(cells[i], style_.width - indent) : std::vector<std::string>{cells[i]};
      block.append(columns_[i].name)
          .append(indent - displayWidth(columns_[i].name), ' ')
          .append(lines.front());
      for (std::size_t next = 1; next < lines.size(); ++next) {
        block.append("\n").append(indent, ' ').append(lines[next]);
      }
      block += '\n';
    }
    output_.write(block);
  }
}

}  // namespace cli
