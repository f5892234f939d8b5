// What is wrong with the description of a board.
#pragma once

#include <stdexcept>
#include <string>

namespace qorsim {

/// Names the part of the board, the key as a board file spells it, and what is wrong with its value.
class BoardError : public std::invalid_argument {
 public:
  BoardError(const std::string& part, const std::string& key, const std::string& problem)
      : std::invalid_argument(part + ": " + key + " " + problem), key_(key), problem_(problem) {}

  const std::string& key() const { return key_; }
  const std::string& problem() const { return problem_; }

 private:
  std::string key_;
  std::string problem_;
};

}  // namespace qorsim
