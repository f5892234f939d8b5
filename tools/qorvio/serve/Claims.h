// Whose the outputs are: a bit belongs to the client that drove it first, until that one lets it go.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "board/model/Signal.h"

namespace qor::tool {

struct Owner {
  unsigned client = 0;
  std::string name;
  std::int64_t since = 0;  ///< seconds since 1970
};

class Claims {
 public:
  explicit Claims(const std::vector<QORVIO_CORE_INFO>& cores);

  /// Who has the first of the output's bits that is anybody's; null when none is.
  const Owner* ownerOf(const Signal& output) const;

  /// The same of another client than this.
  const Owner* otherThan(unsigned client, const Signal& output) const;

  /// Throws Driven, "leds is driven by bench-3, since 12:03", when any bit is another client's.
  void require(unsigned client, const Signal& output) const;

  /// Bits that are the owner's already stay so since then.
  void take(const std::shared_ptr<const Owner>& owner, const Signal& output);

  void release(unsigned client, const Signal& output);
  void releaseAll(unsigned client);

 private:
  using Bits = std::vector<std::shared_ptr<const Owner>>;

  const Bits& portOf(const Signal& output) const;
  Bits& portOf(const Signal& output);

  std::vector<Bits> ports_;  // two per core: async, sync
};

}  // namespace qor::tool
