/// @file
/// What a server of a board and its clients say to each other, as JSON (docs/protocol.md).
///
/// Of what comes from the other end nothing is believed: whatever is not as it should be throws WrongUse, naming it.
#pragma once

#include <cstdint>
#include <exception>
#include <string>
#include <string_view>
#include <vector>

#include <nlohmann/json.hpp>

#include "board/Export.h"
#include "board/model/Assignment.h"
#include "board/model/Sample.h"
#include "board/session/Link.h"

namespace qor {

using Json = nlohmann::ordered_json;

constexpr unsigned protocolVersion = 1;

/// One object. Throws WrongUse for anything else.
QORBOARD_API Json parseMessage(std::string_view text);

/// On one line; bytes that are not UTF-8 become U+FFFD.
QORBOARD_API std::string textOf(const Json& message);

/// A member of that kind. Throws WrongUse when it is missing, or of another kind or size.
/// @{
QORBOARD_API const Json& memberOf(const Json& object, const char* key);
QORBOARD_API const std::string& textIn(const Json& object, const char* key, std::size_t longest = 4096);
QORBOARD_API std::uint64_t numberIn(const Json& object, const char* key, std::uint64_t most);
QORBOARD_API double realIn(const Json& object, const char* key);
QORBOARD_API const Json& listIn(const Json& object, const char* key);
/// @}

/// Hexadecimal digits as a value of that width.
QORBOARD_API Bytes hexIn(const Json& text, unsigned width);
QORBOARD_API void appendHex(std::string& text, const Bytes& value, unsigned width);

/// Port bits as in signals files; the inverse of bitsText().
QORBOARD_API std::vector<unsigned> parseBits(std::string_view text);

QORBOARD_API Json jsonOf(const Signal& signal);
QORBOARD_API Signal signalIn(const Json& json);

QORBOARD_API Json jsonOf(const FoundCore& core);
QORBOARD_API FoundCore coreIn(const Json& json);

/// Members async_in and sync_in: values and flags of whole ports. Reading leaves the sample as it was when it throws.
/// @{
QORBOARD_API void putInputs(Json& message, const Sample& sample, const QORVIO_CORE_INFO& info);
QORBOARD_API void takeInputs(const Json& message, Sample& sample, const QORVIO_CORE_INFO& info);
/// @}

/// Port and bits of an output, of core number `core`; with the steps it is given.
/// @{
QORBOARD_API Json placeOf(const Signal& output);
QORBOARD_API Signal placeIn(const Json& json, const std::vector<QORVIO_CORE_INFO>& infos);
QORBOARD_API Json jsonOf(const Assignment& assignment);
QORBOARD_API Assignment assignmentIn(const Json& json, const std::vector<QORVIO_CORE_INFO>& infos);
/// @}

/// The `kind` of an error, and the error of that kind again.
/// @{
QORBOARD_API const char* kindOf(const std::exception& error);
[[noreturn]] QORBOARD_API void throwKind(const std::string& kind, const std::string& text);
/// @}

}  // namespace qor
