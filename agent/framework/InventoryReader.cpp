#include <agent/framework/InventoryFields.h>
#include <agent/framework/InventoryFile.h>
#include <agent/framework/InventoryScalar.h>
#include <agent/framework/Names.h>

#include <rapidjson/error/en.h>
#include <rapidjson/memorystream.h>
#include <rapidjson/reader.h>

#include <algorithm>
#include <charconv>
#include <cstdint>
#include <limits>
#include <string>
#include <unordered_map>
#include <utility>
#include <vector>

namespace agent {
namespace {

using inventory::Field;
using inventory::Place;
using inventory::Scalar;

/// An object or array that is being read.
struct Frame {
  Place place = Place::Document;
  std::size_t start = 0;   ///< where in the text it starts
  std::size_t index = 0;   ///< of the element that is read, in an array
  std::uint32_t seen = 0;  ///< which fields there were, a bit for each
  Field field{};           ///< that is read, in an object of fields
  std::string member;      ///< its name, or the property's
  int property = 0;        ///< that is read, in "properties"
  std::vector<int> properties;
  NodeTreeBuilder::Handle node = NodeTreeBuilder::noParent;
  std::optional<int> type;
  std::string position;
  std::string description;
  SourceReport report;
};

/// Takes the events of RapidJSON's reader and builds the tree. Throws `InventoryError` at the first event
/// that has no place in an inventory.
class Handler {
 public:
  Handler(std::string_view json, std::string_view fileName, const rapidjson::MemoryStream& stream)
      : json_(json), fileName_(fileName), stream_(stream) {
    frames_.emplace_back();
  }

  NodeTree build() { return builder_.build(); }

  [[nodiscard]] std::string lineAt(std::size_t offset) const {
    const auto end = json_.begin() + static_cast<std::ptrdiff_t>(std::min(offset, json_.size()));
    return std::string(fileName_) + ':' + std::to_string(1 + std::count(json_.begin(), end, '\n'));
  }

  // NOLINTBEGIN(readability-identifier-naming): RapidJSON's reader calls these names
  bool Null() { return value({}); }
  bool Bool(bool) { return value({Scalar::Kind::Bool, 0, {}}); }
  bool Int(int) { return value({Scalar::Kind::OtherNumber, 0, {}}); }
  bool Uint(unsigned int number) { return value({Scalar::Kind::Number, number, {}}); }
  bool Int64(std::int64_t) { return value({Scalar::Kind::OtherNumber, 0, {}}); }
  bool Uint64(std::uint64_t number) { return value({Scalar::Kind::Number, number, {}}); }
  bool Double(double) { return value({Scalar::Kind::OtherNumber, 0, {}}); }
  bool RawNumber(const char*, rapidjson::SizeType, bool) { return value({Scalar::Kind::OtherNumber, 0, {}}); }
  bool String(const char* text, rapidjson::SizeType length, bool) {
    return value({Scalar::Kind::Text, 0, {text, length}});
  }
  bool Key(const char* name, rapidjson::SizeType length, bool) {
    key({name, length});
    return true;
  }
  bool StartObject() {
    startObject();
    return true;
  }
  bool EndObject(rapidjson::SizeType) {
    endObject();
    return true;
  }
  bool StartArray() {
    startArray();
    return true;
  }
  bool EndArray(rapidjson::SizeType) {
    frames_.pop_back();
    return true;
  }
  // NOLINTEND(readability-identifier-naming)

 private:
  Frame& top() { return frames_.back(); }

  /// The field that is read, as a person would name it: nodes[2].children[0].type
  [[nodiscard]] std::string fieldPath() const {
    std::string path;
    for (const Frame& frame : frames_) {
      if (frame.place == Place::Nodes || frame.place == Place::Reports) {
        path += '[' + std::to_string(frame.index) + ']';
      } else if (!frame.member.empty()) {
        path += (path.empty() ? "" : ".") + frame.member;
      }
    }
    return path;
  }

  [[noreturn]] void fail(const std::string& message) const { failAt(stream_.Tell(), message); }

  [[noreturn]] void failAt(std::size_t offset, const std::string& message) const {
    const std::string field = inventory::shownPath(fieldPath());
    throw InventoryError(lineAt(offset) + ": " + field + (field.empty() ? "" : ": ") + message);
  }

  [[noreturn]] void failExpected(const std::string& got) {
    fail("expected " + std::string(expected()) + ", got " + got);
  }

  /// What may stand where the reader is now.
  std::string_view expected() {
    switch (top().place) {
      case Place::Document:
        return "an object";
      case Place::Nodes:
        return "a node (an object)";
      case Place::Reports:
        return "a report (an object)";
      case Place::Properties:
        return "a text that is not empty, or a number from 0 to 4294967295";
      case Place::Top:
      case Place::Node:
      case Place::Report:
        break;
    }
    return inventory::describe(top().field).expected;
  }

  Frame& push(Place place) {
    Frame frame;
    frame.place = place;
    frame.start = stream_.Tell();
    return frames_.emplace_back(std::move(frame));
  }

  void startObject() {
    const Frame& outer = top();
    if (outer.place == Place::Document) {
      push(Place::Top);
    } else if (outer.place == Place::Nodes) {
      startNode();
    } else if (outer.place == Place::Reports) {
      push(Place::Report);
    } else if (outer.place == Place::Node && outer.field == Field::Properties) {
      push(Place::Properties);
    } else {
      failExpected("an object");
    }
  }

  void startArray() {
    const Frame& outer = top();
    const bool hasFields = outer.place == Place::Top || outer.place == Place::Node;
    if (hasFields && (outer.field == Field::Nodes || outer.field == Field::Children)) {
      push(Place::Nodes);
    } else if (hasFields && outer.field == Field::NotRead) {
      push(Place::Reports);
    } else {
      failExpected("an array");
    }
  }

  void startNode() {
    if (++nodeCount_ > InventoryBounds::nodes) {
      fail("an inventory holds at most " + std::to_string(InventoryBounds::nodes) + " nodes");
    }
    // Below the document, the top object and its "nodes", each node takes a frame and its "children" another.
    if ((frames_.size() - 1) / 2 > InventoryBounds::depth) {
      fail("nodes lie at most " + std::to_string(InventoryBounds::depth) + " deep");
    }
    // The parent of the nodes in an array is the object around the array: a node, or the top (no parent).
    const NodeTreeBuilder::Handle parent = frames_[frames_.size() - 2].node;
    const NodeTreeBuilder::Handle node = builder_.add(parent, 0, {}, {});
    push(Place::Node).node = node;
  }

  void key(std::string_view name) {
    Frame& frame = top();
    frame.member = cleanText(name);
    if (frame.place == Place::Properties) {
      propertyKey(name);
      return;
    }
    const inventory::FieldDescription* field = inventory::fieldNamed(frame.place, name);
    if (field == nullptr) {
      fail("unknown member; expected one of " + inventory::fieldNames(frame.place));
    }
    const std::uint32_t bit = 1U << static_cast<unsigned int>(field->field);
    if ((frame.seen & bit) != 0) {
      fail("given twice");
    }
    frame.seen |= bit;
    frame.field = field->field;
  }

  void propertyKey(std::string_view name) {
    Frame& frame = top();
    std::optional<int> property = propertyNamed(name);
    if (!property) {
      int number = -1;
      std::from_chars(name.data(), name.data() + name.size(), number);
      if (number < 0 || std::to_string(number) != name) {
        fail("expected the name of a property or its number");
      }
      property = number;
    }
    if (std::find(frame.properties.begin(), frame.properties.end(), *property) != frame.properties.end()) {
      fail("given twice");
    }
    if (frame.properties.size() == InventoryBounds::propertiesOfNode) {
      fail("a node has at most " + std::to_string(InventoryBounds::propertiesOfNode) + " properties");
    }
    frame.properties.push_back(*property);
    frame.property = *property;
  }

  void endObject() {
    Frame& frame = top();
    frame.member.clear();
    for (const inventory::FieldDescription& field : inventory::fields) {
      const std::uint32_t bit = 1U << static_cast<unsigned int>(field.field);
      if (field.place == frame.place && field.isRequired && (frame.seen & bit) == 0) {
        failAt(frame.start,
               "\"" + std::string(field.name) + "\" is missing; expected " + std::string(field.expected));
      }
    }
    if (frame.place == Place::Node) {
      builder_.describe(frame.node, *frame.type, frame.position, frame.description);
    } else if (frame.place == Place::Report) {
      builder_.addReport(std::move(frame.report));
    }
    frames_.pop_back();
    ++top().index;
  }

  bool value(const Scalar& scalar) {
    const Place place = top().place;
    const bool isTaken = place == Place::Properties ? takeProperty(scalar)
                         : place == Place::Top      ? takeHead(scalar)
                         : place == Place::Node     ? takeNodeField(scalar)
                         : place == Place::Report   ? takeReportField(scalar)
                                                    : false;
    if (!isTaken) {
      failExpected(shown(scalar));
    }
    return true;
  }

  bool takeHead(const Scalar& scalar) {
    switch (top().field) {
      case Field::Format:
        return scalar.kind == Scalar::Kind::Text && scalar.text == inventory::formatName;
      case Field::Version:
        return scalar.kind == Scalar::Kind::Number && scalar.number == inventory::formatVersion;
      default:
        return false;
    }
  }

  bool takeProperty(const Scalar& scalar) {
    // The properties' frame stands on that of its node.
    const NodeTreeBuilder::Handle node = frames_[frames_.size() - 2].node;
    if (scalar.kind == Scalar::Kind::Number && scalar.number <= std::numeric_limits<std::uint32_t>::max()) {
      builder_.setValue(node, top().property, static_cast<std::uint32_t>(scalar.number));
      return true;
    }
    return scalar.kind == Scalar::Kind::Text && builder_.setText(node, top().property, scalar.text);
  }

  bool takeNodeField(const Scalar& scalar) {
    Frame& frame = top();
    if (frame.field == Field::Type) {
      return takeType(scalar);
    }
    if (scalar.kind != Scalar::Kind::Text) {
      return false;
    }
    switch (frame.field) {
      case Field::Position:
        frame.position = scalar.text;
        return true;
      case Field::Description:
        frame.description = scalar.text;
        return true;
      case Field::Id:
        return takeId(scalar.text);
      default:
        return false;
    }
  }

  bool takeType(const Scalar& scalar) {
    if (scalar.kind == Scalar::Kind::Text) {
      top().type = nodeTypeNamed(scalar.text);
    } else if (scalar.kind == Scalar::Kind::Number &&
               scalar.number <= std::numeric_limits<std::int32_t>::max()) {
      top().type = static_cast<int>(scalar.number);
    }
    return top().type.has_value();
  }

  bool takeId(std::string_view text) {
    const std::optional<NodeNumber> number = numberFromText(text);
    if (!number || *number == noNumber || *number == overflowNumber) {
      return false;
    }
    const auto [earlier, isNew] = idOffsets_.try_emplace(*number, stream_.Tell());
    if (!isNew) {
      fail("the number " + pathText(*number) + " is that of another node already, on " +
           lineAt(earlier->second));
    }
    builder_.setNumber(top().node, *number);
    return true;
  }

  bool takeReportField(const Scalar& scalar) {
    if (scalar.kind != Scalar::Kind::Text) {
      return false;
    }
    SourceReport& report = top().report;
    switch (top().field) {
      case Field::Source:
        report.source = scalar.text;
        return true;
      case Field::Path:
        report.path = scalar.text;
        return true;
      case Field::Detail:
        report.detail = scalar.text;
        return true;
      case Field::Reason: {
        const std::optional<SourceReport::Reason> reason = inventory::reasonNamed(scalar.text);
        report.reason = reason.value_or(report.reason);
        return reason.has_value();
      }
      default:
        return false;
    }
  }

  std::string_view json_;
  std::string_view fileName_;
  const rapidjson::MemoryStream& stream_;
  std::vector<Frame> frames_;
  NodeTreeBuilder builder_;
  std::size_t nodeCount_ = 0;
  std::unordered_map<NodeNumber, std::size_t> idOffsets_;  ///< where in the text each id was given
};

}  // namespace

NodeTree parseInventory(std::string_view json, std::string_view fileName) {
  if (json.size() > InventoryBounds::bytes) {
    throw InventoryError(std::string(fileName) + ": bigger than the " +
                         std::to_string(InventoryBounds::bytes) + " bytes that an inventory may have");
  }
  rapidjson::MemoryStream stream(json.data(), json.size());
  Handler handler(json, fileName, stream);
  rapidjson::Reader reader;
  constexpr unsigned int flags = rapidjson::kParseIterativeFlag | rapidjson::kParseValidateEncodingFlag;
  if (!reader.Parse<flags>(stream, handler)) {
    throw InventoryError(handler.lineAt(reader.GetErrorOffset()) +
                         ": not JSON: " + rapidjson::GetParseError_En(reader.GetParseErrorCode()));
  }
  // The reader takes a zero byte for the end of the text.
  if (stream.Tell() != json.size()) {
    throw InventoryError(handler.lineAt(stream.Tell()) + ": not JSON: a zero byte after the inventory");
  }
  return handler.build();
}

}  // namespace agent
