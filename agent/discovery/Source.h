// What a source of the discovery is, and what it finds.
//
// A source reads through its `SourceContext` alone: reads are bounded, and each one that fails is reported.
#pragma once

#include <agent/discovery/SystemRoot.h>
#include <agent/framework/NodeTree.h>

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace agent::discovery {

/// A node that a source found, with what it found below it. Descriptions steer what a node counts as, so they
/// are the source's own words; of what the machine says, only names of ports and drivers go into one.
struct FoundNode {
  int type = 0;
  std::string position;  ///< the place on the bus: with the type, what the node's number is made of
  std::string description;
  std::vector<std::pair<int, std::string>> texts;      ///< text properties
  std::vector<std::pair<int, std::uint32_t>> numbers;  ///< number properties
  std::vector<FoundNode> children;
  /// Of firmware: other texts that its version goes by, where a table may declare it under one of them.
  std::vector<std::string> otherVersions = {};

  /// Sets a text property; absent is absent.
  void setText(int property, const std::optional<std::string>& text) {
    if (text) {
      texts.emplace_back(property, *text);
    }
  }
  void setValue(int property, std::uint32_t number) { numbers.emplace_back(property, number); }
};

/// Firmware that a table of the machine lists, and that a source may have found as well (`Merge.h`).
struct DeclaredFirmware {
  int list = 0;      ///< which of the table's lists it stands on; two entries of one list are two elements
  FoundNode node;    ///< as it stands in the tree where no source found it
  std::string kind;  ///< the description that a source would give it; empty where the table does not tell
  /// What it belongs to; none: the computer, or nobody knows. A device that was found at the same position
  /// takes its place.
  std::optional<FoundNode> device;
};

/// All that one source found.
struct SourceResult {
  std::optional<std::string> computerName;
  std::vector<FoundNode> nodes;  ///< what stands directly below the computer, in order
  std::vector<DeclaredFirmware> declared;
  std::vector<SourceReport> reports;
};

/// Where a source and the one who waits for it meet.
class SourceBoard;

/// The source's side: what it reads with, and where it puts what it finds. Used by the source's thread alone.
class SourceContext {
 public:
  /// What a source does not say more often than this is still counted.
  static constexpr std::size_t reportLimit = 64;

  SourceContext(std::string source, SystemRoot root, std::shared_ptr<SourceBoard> board);

  [[nodiscard]] const SystemRoot& root() const { return root_; }
  SourceResult& result() { return result_; }

  /// The text of an attribute, through `meaningful`; what cannot be read or says nothing is reported.
  std::optional<std::string> text(const std::string& path);
  /// The same, except that it is no matter for a report where there is no such attribute or it says nothing.
  std::optional<std::string> textIfAny(const std::string& path);
  /// The names in a folder; empty where it cannot be read, which is reported.
  std::vector<std::string> list(const std::string& path);
  /// The same, except that it is no matter for a report where there is no such folder: for what many machines
  /// lack.
  std::vector<std::string> listIfAny(const std::string& path);

  /// Says what the source does next, for the report should that never end.
  void doing(const std::string& what);
  /// Reports that `path` could not be read, and the system's reason.
  void reportError(const std::string& path, int error);
  void report(const std::string& path, SourceReport::Reason reason, const std::string& detail);

  /// Makes what was found up to now the source's result in case the rest does not end in time.
  void publish();

 private:
  std::string source_;
  SystemRoot root_;
  std::shared_ptr<SourceBoard> board_;
  SourceResult result_;
  std::size_t unsaid_ = 0;
};

struct Source {
  std::string name;
  /// Runs on a thread that may outlive everything else: it owns, or shares, all that it uses.
  std::function<void(SourceContext&)> read;
};

/// The reason that an errno value stands for, and the system's words for it.
SourceReport::Reason reasonOf(int error);
std::string errorText(int error);

}  // namespace agent::discovery
