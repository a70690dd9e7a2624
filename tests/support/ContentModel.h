// Content models of XML document types: which children an element may have, in which order.
#pragma once

#include <cstddef>
#include <set>
#include <string>
#include <string_view>
#include <vector>

/// A model such as "(A|(B?,C*))", as an automaton that is fed with one child after the other.
class ContentModel {
 public:
  using Position = std::set<std::size_t>;

  /// Throws `std::invalid_argument` where the text is no model.
  explicit ContentModel(std::string_view text);

  [[nodiscard]] Position start() const;
  /// Where a child of this name leads; empty: it has no place there.
  [[nodiscard]] Position after(const Position& position, std::string_view child) const;
  /// Whether the content may end here.
  [[nodiscard]] bool isComplete(const Position& position) const { return position.contains(end_); }

 private:
  struct State {
    std::string name;  // of the child that leads from here to `next`
    std::size_t next = 0;
    std::vector<std::size_t> withoutChild;  // states that are reached from here as well
  };
  struct Piece {
    std::size_t first;
    std::size_t last;
  };

  std::size_t add();
  void link(std::size_t from, std::size_t to) { states_[from].withoutChild.push_back(to); }
  Piece readParticle();
  Piece readGroup();
  Piece readRepeated(Piece piece);
  [[nodiscard]] char peek() const { return position_ < text_.size() ? text_[position_] : '\0'; }
  void reach(std::size_t state, Position& reached) const;

  std::string_view text_;  // while it is read
  std::size_t position_ = 0;
  std::vector<State> states_;
  std::size_t start_ = 0;
  std::size_t end_ = 0;
};
