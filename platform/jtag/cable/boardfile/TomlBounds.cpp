#include "platform/jtag/cable/boardfile/TomlBounds.h"

#include <algorithm>
#include <stdexcept>

namespace QorRT {
namespace {

/// Walks over a text as the parser does, as far as that takes the text for TOML: it counts what nests, and skips strings
/// and comments.
class NestingScan {
 public:
  NestingScan(std::string_view text, const std::string& file) : text_(text), file_(file) {}

  void run() {
    while (at_ < text_.size()) step();
  }

 private:
  void step() {
    const char each = text_[at_];
    if (each == '"' || each == '\'') return skipString(each);
    if (each == '#') return skipComment();
    if (each == '[' || each == '{') count(levels_);
    if ((each == ']' || each == '}') && levels_ > 0) --levels_;
    if (each == '.') count(parts_);
    if (std::string_view("=,[]{}\n").find(each) != std::string_view::npos) parts_ = 0;
    if (each == '\n') ++line_;
    ++at_;
  }

  void count(unsigned& levels) const {
    if (++levels <= mostTomlLevels) return;
    throw std::invalid_argument(file_ + ":" + std::to_string(line_) + ": is nested more than " +
                                std::to_string(mostTomlLevels) + " levels deep");
  }

  void skipComment() {
    while (at_ < text_.size() && text_[at_] != '\n') ++at_;
  }

  // One in three quotes goes over lines, and may end with up to two quotes more.
  void skipString(char quote) {
    const std::size_t begin = at_;
    const bool overLines = text_.substr(at_, 3) == std::string(3, quote);
    const std::string mark(overLines ? 3 : 1, quote);
    at_ += mark.size();
    while (at_ < text_.size() && text_.compare(at_, mark.size(), mark) != 0 &&
           (overLines || text_[at_] != '\n'))
      at_ += quote == '"' && text_[at_] == '\\' ? 2 : 1;
    at_ = std::min(at_ + mark.size(), text_.size());
    for (int more = 0; overLines && more < 2 && at_ < text_.size() && text_[at_] == quote; ++more) ++at_;
    line_ += static_cast<std::size_t>(std::count(text_.data() + begin, text_.data() + at_, '\n'));
  }

  std::string_view text_;
  const std::string& file_;
  std::size_t at_ = 0;
  std::size_t line_ = 1;
  unsigned levels_ = 0;  // of brackets and braces
  unsigned parts_ = 0;   // of the key that is read
};

}  // namespace

void requireTomlBounds(std::string_view text, const std::string& file) {
  if (text.size() > mostTomlBytes)
    throw std::invalid_argument(file + ": is larger than " + std::to_string(mostTomlBytes) + " bytes");
  NestingScan(text, file).run();
}

}  // namespace QorRT
