#include <agent/framework/InventoryFields.h>
#include <agent/framework/InventoryFile.h>
#include <agent/framework/Names.h>

#include <fcntl.h>
#include <rapidjson/prettywriter.h>
#include <rapidjson/stringbuffer.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <string>
#include <system_error>
#include <vector>

namespace agent {
namespace {

using inventory::Field;
using inventory::nameOf;

class Descriptor {
 public:
  // A pipe or a device in the place of a file must not hold up the caller: hence O_NONBLOCK.
  explicit Descriptor(const std::filesystem::path& path)
      : number_(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK)) {}
  ~Descriptor() {
    if (number_ >= 0) {
      ::close(number_);
    }
  }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  [[nodiscard]] int number() const { return number_; }

 private:
  int number_;
};

[[noreturn]] void throwUnreadable(const std::filesystem::path& path, int error) {
  throw InventoryError(path.string() + ": cannot be read: " + std::generic_category().message(error));
}

/// Folders pass: reading one says best what is wrong with it.
void checkThatItIsAFile(const Descriptor& file, const std::filesystem::path& path) {
  struct stat status {};
  if (::fstat(file.number(), &status) != 0) {
    throwUnreadable(path, errno);
  }
  if (!S_ISREG(status.st_mode) && !S_ISDIR(status.st_mode)) {
    throw InventoryError(path.string() + ": cannot be read: it is no regular file");
  }
}

std::string readWhole(const std::filesystem::path& path) {
  const Descriptor file(path);
  if (file.number() < 0) {
    throwUnreadable(path, errno);
  }
  checkThatItIsAFile(file, path);
  std::string content;
  constexpr std::size_t step = std::size_t{1} << 16U;
  for (;;) {
    const std::size_t filled = content.size();
    content.resize(std::max(filled + step, filled * 2));
    const ssize_t count = ::read(file.number(), content.data() + filled, content.size() - filled);
    if (count < 0 && errno != EINTR) {
      throwUnreadable(path, errno);
    }
    content.resize(filled + static_cast<std::size_t>(std::max<ssize_t>(count, 0)));
    if (count == 0 || content.size() > InventoryBounds::bytes) {
      return content;
    }
  }
}

using JsonWriter = rapidjson::PrettyWriter<rapidjson::StringBuffer>;

class Writer {
 public:
  explicit Writer(const NodeTree& tree) : tree_(tree), json_(buffer_) { json_.SetIndent(' ', 2); }

  std::string write() {
    json_.StartObject();
    member(Field::Format, inventory::formatName);
    key(nameOf(Field::Version));
    json_.Uint(inventory::formatVersion);
    key(nameOf(Field::Nodes));
    json_.StartArray();
    nodes();
    json_.EndArray();
    if (!tree_.reports().empty()) {
      reports();
    }
    json_.EndObject();
    std::string text(buffer_.GetString(), buffer_.GetSize());
    text += '\n';
    if (text.size() > InventoryBounds::bytes) {
      throw InventoryError("the tree is too big for an inventory file");
    }
    return text;
  }

 private:
  void text(std::string_view text) {
    json_.String(text.data(), static_cast<rapidjson::SizeType>(text.size()));
  }
  void key(std::string_view name) { json_.Key(name.data(), static_cast<rapidjson::SizeType>(name.size())); }
  void member(Field field, std::string_view value) {
    key(nameOf(field));
    text(value);
  }
  void optionalMember(Field field, std::string_view value) {
    if (!value.empty()) {
      member(field, value);
    }
  }

  void nodes() {
    if (tree_.size() > InventoryBounds::nodes) {
      throw InventoryError("the tree has more nodes than an inventory file may hold");
    }
    // Ends of the subtrees whose "children" are open.
    std::vector<NodeTree::Index> open;
    for (NodeTree::Index node = 0; node < tree_.size(); ++node) {
      startNode(node);
      if (tree_.subtreeEnd(node) != node + 1) {
        open.push_back(tree_.subtreeEnd(node));
        if (open.size() >= InventoryBounds::depth) {
          throw InventoryError("the tree is deeper than an inventory file may be");
        }
        key(nameOf(Field::Children));
        json_.StartArray();
        continue;
      }
      json_.EndObject();
      while (!open.empty() && open.back() == node + 1) {
        open.pop_back();
        json_.EndArray();
        json_.EndObject();
      }
    }
  }

  void startNode(NodeTree::Index node) {
    json_.StartObject();
    key(nameOf(Field::Type));
    if (const std::optional<std::string_view> name = nodeTypeName(tree_.type(node))) {
      text(*name);
    } else {
      json_.Int(tree_.type(node));
    }
    optionalMember(Field::Position, tree_.position(node));
    member(Field::Id, pathText(tree_.number(node)));
    optionalMember(Field::Description, tree_.description(node));
    properties(tree_.properties(node));
  }

  void properties(const std::vector<PropertyView>& properties) {
    if (properties.empty()) {
      return;
    }
    if (properties.size() > InventoryBounds::propertiesOfNode) {
      throw InventoryError("a node has more properties than an inventory file may hold");
    }
    key(nameOf(Field::Properties));
    json_.StartObject();
    for (const PropertyView& property : properties) {
      const std::optional<std::string_view> name = propertyName(property.id);
      key(name ? std::string(*name) : std::to_string(property.id));
      if (property.isText) {
        text(property.text);
      } else {
        json_.Uint(property.number);
      }
    }
    json_.EndObject();
  }

  void reports() {
    key(nameOf(Field::NotRead));
    json_.StartArray();
    for (const SourceReport& report : tree_.reports()) {
      json_.StartObject();
      member(Field::Source, report.source);
      optionalMember(Field::Path, report.path);
      member(Field::Reason, inventory::reasonName(report.reason));
      optionalMember(Field::Detail, report.detail);
      json_.EndObject();
    }
    json_.EndArray();
  }

  const NodeTree& tree_;
  rapidjson::StringBuffer buffer_;
  JsonWriter json_;
};

}  // namespace

NodeTree readInventoryFile(const std::filesystem::path& path) {
  return parseInventory(readWhole(path), path.string());
}

std::string writeInventory(const NodeTree& tree) {
  return Writer(tree).write();
}

}  // namespace agent
