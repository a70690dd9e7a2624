#include "ContentModel.h"

#include <stdexcept>

ContentModel::ContentModel(std::string_view text) : text_(text) {
  const Piece whole = readParticle();
  if (position_ != text_.size())
    throw std::invalid_argument("no content model: " + std::string(text));
  start_ = whole.first;
  end_ = whole.last;
  text_ = {};
}

std::size_t ContentModel::add() {
  states_.emplace_back();
  return states_.size() - 1;
}

// A name or a group, repeated or not.
ContentModel::Piece ContentModel::readParticle() {
  if (peek() == '(')
    return readRepeated(readGroup());
  const std::size_t start = position_;
  while (peek() != '\0' && std::string_view("(),|?*+").find(peek()) == std::string_view::npos)
    ++position_;
  if (start == position_)
    throw std::invalid_argument("a name is missing in " + std::string(text_));
  const Piece piece{add(), add()};
  states_[piece.first].name = text_.substr(start, position_ - start);
  states_[piece.first].next = piece.last;
  return readRepeated(piece);
}

ContentModel::Piece ContentModel::readGroup() {
  ++position_;
  const Piece group{add(), add()};
  Piece particle = readParticle();
  const char separator = peek();
  link(group.first, particle.first);
  while (peek() == separator && (separator == ',' || separator == '|')) {
    ++position_;
    const Piece next = readParticle();
    if (separator == ',') {
      link(particle.last, next.first);
    } else {
      link(particle.last, group.last);
      link(group.first, next.first);
    }
    particle = next;
  }
  link(particle.last, group.last);
  if (peek() != ')')
    throw std::invalid_argument("a parenthesis is missing in " + std::string(text_));
  ++position_;
  return group;
}

ContentModel::Piece ContentModel::readRepeated(Piece piece) {
  const char sign = peek();
  if (sign != '?' && sign != '*' && sign != '+')
    return piece;
  ++position_;
  const Piece repeated{add(), add()};
  link(repeated.first, piece.first);
  link(piece.last, repeated.last);
  if (sign != '+')
    link(repeated.first, repeated.last);
  if (sign != '?')
    link(piece.last, piece.first);
  return repeated;
}

void ContentModel::reach(std::size_t state, Position& reached) const {
  if (!reached.insert(state).second)
    return;
  for (const std::size_t next : states_[state].withoutChild)
    reach(next, reached);
}

ContentModel::Position ContentModel::start() const {
  Position reached;
  reach(start_, reached);
  return reached;
}

ContentModel::Position ContentModel::after(const Position& position, std::string_view child) const {
  Position reached;
  for (const std::size_t state : position)
    if (!states_[state].name.empty() && states_[state].name == child)
      reach(states_[state].next, reached);
  return reached;
}
