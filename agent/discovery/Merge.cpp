#include <agent/discovery/Merge.h>
#include <agent/discovery/SameElement.h>

#include <Oru/NodeLexicon.h>

#include <algorithm>
#include <functional>
#include <iterator>
#include <map>
#include <set>
#include <string>
#include <utility>

namespace agent::discovery {

namespace {

using Oru::NodeLexicon::FirmwareNode;

/// Of one property, what the node has stands.
void setMissing(FoundNode& node, const FoundNode& from) {
  const auto lacks = [](const auto& properties, int property) {
    return std::none_of(properties.begin(), properties.end(),
                        [property](const auto& known) { return known.first == property; });
  };
  for (const auto& [property, text] : from.texts) {
    if (lacks(node.texts, property)) {
      node.texts.emplace_back(property, text);
    }
  }
  for (const auto& [property, number] : from.numbers) {
    if (lacks(node.numbers, property)) {
      node.numbers.emplace_back(property, number);
    }
  }
}

void join(FoundNode& node, FoundNode& from) {
  setMissing(node, from);
  for (FoundNode& child : from.children) {
    const auto same = std::find_if(node.children.begin(), node.children.end(), [&](const FoundNode& known) {
      return known.type == child.type && known.position == child.position;
    });
    if (same == node.children.end()) {
      node.children.push_back(std::move(child));
    } else {
      join(*same, child);
    }
  }
}

/// Leaves each node that an earlier result has as well to that one.
void joinPlaces(std::vector<SourceResult>& results) {
  std::map<std::pair<int, std::string>, FoundNode*> earlier;
  for (SourceResult& result : results) {
    std::vector<FoundNode> own;
    for (FoundNode& node : result.nodes) {
      const auto known = earlier.find({node.type, node.position});
      if (known == earlier.end()) {
        own.push_back(std::move(node));
      } else {
        join(*known->second, node);
      }
    }
    result.nodes = std::move(own);
    for (FoundNode& node : result.nodes) {
      earlier.emplace(std::pair(node.type, node.position), &node);
    }
  }
}

using Visit = std::function<void(FoundNode& node, const FoundNode* parent)>;

void visitAll(std::vector<FoundNode>& nodes, const FoundNode* parent, const Visit& visit) {
  for (FoundNode& node : nodes) {
    visit(node, parent);
    visitAll(node.children, &node, visit);
  }
}

void visitAll(std::vector<SourceResult>& results, const Visit& visit) {
  for (SourceResult& result : results) {
    visitAll(result.nodes, nullptr, visit);
  }
}

/// A firmware node that a declaration may repeat.
struct Candidate {
  FoundNode* node = nullptr;
  std::string device;   ///< the position of what it stands below
  std::set<int> lists;  ///< on which it is declared
};

void take(FoundNode& node, const DeclaredFirmware& declared) {
  if (const std::string* version = declaredVersion(node, declared.node)) {
    setText(node, Oru::NodeLexicon::VersionStringProperty, *version);
  }
  setMissing(node, declared.node);
}

/// Gives each declaration to the node that it repeats, and leaves the others.
void joinDeclared(std::vector<SourceResult>& results) {
  std::vector<Candidate> candidates;
  std::set<std::string> kinds;
  visitAll(results, [&](FoundNode& node, const FoundNode* parent) {
    if (node.type == FirmwareNode) {
      candidates.push_back({&node, parent == nullptr ? std::string() : parent->position, {}});
      kinds.insert(node.description);
    }
  });
  for (SourceResult& result : results) {
    std::vector<DeclaredFirmware> others;
    others.reserve(result.declared.size());  // what it holds stays in its place
    for (DeclaredFirmware& declared : result.declared) {
      const auto same = std::find_if(candidates.begin(), candidates.end(), [&](const Candidate& known) {
        return !known.lists.contains(declared.list) && isSameElement(*known.node, known.device, declared);
      });
      if (same != candidates.end()) {
        take(*same->node, declared);
        same->lists.insert(declared.list);
        continue;
      }
      if (!declared.kind.empty() && kinds.insert(declared.kind).second) {
        declared.node.description = declared.kind;
      }
      others.push_back(std::move(declared));
      candidates.push_back({&others.back().node,
                            others.back().device ? others.back().device->position : std::string(),
                            {others.back().list}});
    }
    result.declared = std::move(others);
  }
}

/// Puts what is declared alone below its device, or below the computer.
void placeDeclared(std::vector<SourceResult>& results) {
  std::map<std::string, std::vector<FoundNode>> waiting;  // by the position of their device
  for (SourceResult& result : results) {
    for (DeclaredFirmware& declared : result.declared) {
      if (!declared.device) {
        result.nodes.push_back(std::move(declared.node));
        continue;
      }
      std::vector<FoundNode>& children = waiting[declared.device->position];
      children.push_back(std::move(declared.node));
    }
  }
  visitAll(results, [&](FoundNode& node, const FoundNode*) {
    const auto here = node.type == FirmwareNode ? waiting.end() : waiting.find(node.position);
    if (here != waiting.end()) {
      std::move(here->second.begin(), here->second.end(), std::back_inserter(node.children));
      waiting.erase(here);
    }
  });
  for (SourceResult& result : results) {
    for (DeclaredFirmware& declared : result.declared) {
      const auto here = declared.device ? waiting.find(declared.device->position) : waiting.end();
      if (here != waiting.end()) {
        declared.device->children = std::move(here->second);
        waiting.erase(here);
        result.nodes.push_back(std::move(*declared.device));
      }
    }
  }
}

}  // namespace

std::vector<FoundNode> mergeResults(std::vector<SourceResult>& results) {
  joinPlaces(results);
  joinDeclared(results);
  placeDeclared(results);
  std::vector<FoundNode> nodes;
  for (SourceResult& result : results) {
    std::move(result.nodes.begin(), result.nodes.end(), std::back_inserter(nodes));
  }
  return nodes;
}

}  // namespace agent::discovery
