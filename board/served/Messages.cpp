#include "board/served/Messages.h"

#include <algorithm>
#include <charconv>

#include "QorVIO_CoreFields.h"
#include "board/model/CoreAddress.h"
#include "board/model/Digits.h"
#include "board/model/Errors.h"
#include "board/model/Value.h"

namespace qor {
namespace {

constexpr unsigned widest = 65535;

[[noreturn]] void refuse(const std::string& what) {
  throw WrongUse("the message cannot be used: " + what);
}

unsigned bitNumber(std::string_view text) {
  unsigned number = 0;
  const auto [rest, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (error != std::errc() || rest != text.data() + text.size() || number >= widest)
    refuse("not bits of a port");
  return number;
}

Port portNamed(const std::string& name) {
  for (const Port port : {Port::syncOut, Port::syncIn, Port::asyncOut, Port::asyncIn})
    if (name == portName(port)) return port;
  refuse("no port of that name");
}

std::uint64_t low64(const Bytes& value) {
  std::uint64_t number = 0;
  for (std::size_t i = 0; i < std::min<std::size_t>(value.size(), 8); ++i)
    number |= std::uint64_t{value[i]} << 8 * i;
  return number;
}

std::string enumText(std::uint64_t value, unsigned width) {
  Bytes bits(byteCount(width));
  for (std::size_t i = 0; i < std::min<std::size_t>(bits.size(), 8); ++i)
    bits[i] = static_cast<unsigned char>(value >> 8 * i);
  return hexText(bits, width);
}

using Image = Bytes Sample::*;
constexpr Image asyncImages[] = {&Sample::asyncIn, &Sample::asyncUp, &Sample::asyncDown};
constexpr Image syncImages[] = {&Sample::syncIn, &Sample::syncUp, &Sample::syncDown, &Sample::syncSyncUp,
                                &Sample::syncSyncDown};

template <std::size_t Count>
Json imagesOf(const Sample& sample, const Image (&images)[Count], unsigned width) {
  Json list = Json::array();
  for (const Image image : images) list.push_back(hexText(sample.*image, width));
  return list;
}

template <std::size_t Count>
void imagesIn(const Json& list, Sample& sample, const Image (&images)[Count], unsigned width) {
  if (list.size() != Count) refuse("not as many images as a port has");
  for (std::size_t i = 0; i < Count; ++i) sample.*images[i] = width == 0 ? Bytes() : hexIn(list[i], width);
}

}  // namespace

Json parseMessage(std::string_view text) {
  constexpr int deepest = 16;
  const auto isShallow = [](int depth, Json::parse_event_t, Json&) {
    if (depth > deepest) refuse("too deep");
    return true;
  };
  Json message;
  try {
    message = Json::parse(text, isShallow);
  } catch (const Json::exception&) {
    refuse("no JSON");
  }
  if (!message.is_object()) refuse("no object");
  return message;
}

std::string textOf(const Json& message) {
  return message.dump(-1, ' ', false, Json::error_handler_t::replace);
}

const Json& memberOf(const Json& object, const char* key) {
  if (!object.is_object()) refuse("no object with the member " + std::string(key));
  const auto member = object.find(key);
  if (member == object.end()) refuse("no member " + std::string(key));
  return *member;
}

const std::string& textIn(const Json& object, const char* key, std::size_t longest) {
  const Json& member = memberOf(object, key);
  if (!member.is_string()) refuse("no text: " + std::string(key));
  const auto& text = member.get_ref<const std::string&>();
  if (text.size() > longest) refuse("too long: " + std::string(key));
  return text;
}

std::uint64_t numberIn(const Json& object, const char* key, std::uint64_t most) {
  const Json& member = memberOf(object, key);
  if (!member.is_number_unsigned() || member.get<std::uint64_t>() > most)
    refuse("no whole number up to " + std::to_string(most) + ": " + key);
  return member.get<std::uint64_t>();
}

double realIn(const Json& object, const char* key) {
  const Json& member = memberOf(object, key);
  if (!member.is_number()) refuse("no number: " + std::string(key));
  return member.get<double>();
}

const Json& listIn(const Json& object, const char* key) {
  const Json& member = memberOf(object, key);
  if (!member.is_array()) refuse("no list: " + std::string(key));
  return member;
}

Bytes hexIn(const Json& text, unsigned width) {
  if (!text.is_string()) refuse("no text as value");
  std::optional<Bytes> value = numberOf(text.get_ref<const std::string&>(), 16, width);
  if (!value || bitLength(*value) > width)
    refuse("no hexadecimal value of " + std::to_string(width) + " bits");
  value->resize(byteCount(width));
  return *value;
}

void appendHex(std::string& text, const Bytes& value, unsigned width) {
  for (unsigned digit = (width + 3) / 4; digit-- > 0;)
    text += "0123456789ABCDEF"[value[digit / 2] >> 4 * (digit % 2) & 15];
}

std::vector<unsigned> parseBits(std::string_view text) {
  std::vector<unsigned> bits;
  const std::size_t colon = text.find(':');
  if (colon != text.npos) {
    const unsigned high = bitNumber(text.substr(0, colon)), low = bitNumber(text.substr(colon + 1));
    for (unsigned bit = low;; bit = bit < high ? bit + 1 : bit - 1) {
      bits.push_back(bit);
      if (bit == high) return bits;
    }
  }
  for (std::size_t comma = 0; comma != text.npos; text.remove_prefix(comma == text.npos ? 0 : comma + 1)) {
    comma = text.find(',');
    bits.push_back(bitNumber(text.substr(0, comma)));
    if (bits.size() > widest) refuse("too many bits");
  }
  std::reverse(bits.begin(), bits.end());
  return bits;
}

Json jsonOf(const Signal& signal) {
  Json json{{"name", signal.name},
            {"direction", isInput(signal.port) ? "input" : "output"},
            {"core", signal.core},
            {"port", portName(signal.port)},
            {"bits", bitsText(signal.bits)},
            {"width", signal.width()},
            {"radix", radixName(signal.radix)}};
  for (const auto& [name, value] : signal.names) json["enum"][name] = enumText(value, signal.width());
  if (signal.scale != 0) json["scale"] = signal.scale;
  if (!signal.unit.empty()) json["unit"] = signal.unit;
  if (!signal.description.empty()) json["description"] = signal.description;
  return json;
}

Signal signalIn(const Json& json) {
  Signal signal;
  signal.name = textIn(json, "name");
  signal.core = numberIn(json, "core", widest);
  signal.port = portNamed(textIn(json, "port"));
  signal.bits = parseBits(textIn(json, "bits", 1U << 20));
  signal.radix = radixNamed(textIn(json, "radix"));
  if (json.contains("enum"))
    for (const auto& [name, value] : memberOf(json, "enum").items())
      signal.names.emplace_back(name, low64(hexIn(value, signal.width())));
  if (json.contains("scale")) signal.scale = realIn(json, "scale");
  if (json.contains("unit")) signal.unit = textIn(json, "unit");
  if (json.contains("description")) signal.description = textIn(json, "description", 1U << 16);
  return signal;
}

Json jsonOf(const FoundCore& core) {
  Json json{{"core", refText(core.ref)}};
  for (const QorRT::QorVIO_CoreField& field : QorRT::QorVIO_coreFields)
    if (core.isVio() || field.isGeneric) json[field.name] = core.info.*field.member;
  return json;
}

FoundCore coreIn(const Json& json) {
  FoundCore core{parseRef(textIn(json, "core")), {}};
  for (const QorRT::QorVIO_CoreField& field : QorRT::QorVIO_coreFields)
    if (json.contains(field.name))
      core.info.*field.member = static_cast<unsigned>(numberIn(json, field.name, widest));
  return core;
}

void putInputs(Json& message, const Sample& sample, const QORVIO_CORE_INFO& info) {
  message["async_in"] = imagesOf(sample, asyncImages, info.async_input_count);
  message["sync_in"] = imagesOf(sample, syncImages, info.sync_input_count);
}

void takeInputs(const Json& message, Sample& sample, const QORVIO_CORE_INFO& info) {
  Sample taken;
  imagesIn(listIn(message, "async_in"), taken, asyncImages, info.async_input_count);
  imagesIn(listIn(message, "sync_in"), taken, syncImages, info.sync_input_count);
  std::swap(sample, taken);
}

Json placeOf(const Signal& output) {
  return {{"core", output.core}, {"port", portName(output.port)}, {"bits", bitsText(output.bits)}};
}

Signal placeIn(const Json& json, const std::vector<QORVIO_CORE_INFO>& infos) {
  Signal output;
  output.core = numberIn(json, "core", infos.size() - 1);
  output.port = portNamed(textIn(json, "port"));
  if (isInput(output.port)) refuse("no output port");
  output.bits = parseBits(textIn(json, "bits", 1U << 20));
  if (*std::max_element(output.bits.begin(), output.bits.end()) >= widthOf(infos[output.core], output.port))
    refuse("bits beyond the port");
  return output;
}

Json jsonOf(const Assignment& assignment) {
  Json json = placeOf(assignment.signal);
  json["name"] = assignment.signal.name;
  json["steps"] = Json::array();
  for (const Bytes& step : assignment.steps)
    json["steps"].push_back(hexText(step, assignment.signal.width()));
  return json;
}

Assignment assignmentIn(const Json& json, const std::vector<QORVIO_CORE_INFO>& infos) {
  Assignment assignment{placeIn(json, infos), {}};
  assignment.signal.name = textIn(json, "name");
  const Json& steps = listIn(json, "steps");
  if (steps.size() != 1 && (steps.size() != stepCount || assignment.signal.port != Port::syncOut))
    refuse("not 1 step, nor 16 of a synchronous output");
  for (const Json& each : steps) assignment.steps.push_back(hexIn(each, assignment.signal.width()));
  return assignment;
}

const char* kindOf(const std::exception& error) {
  if (dynamic_cast<const UnknownSignal*>(&error) != nullptr) return "unknown";
  if (dynamic_cast<const WrongUse*>(&error) != nullptr) return "use";
  if (dynamic_cast<const Driven*>(&error) != nullptr) return "driven";
  return "failure";
}

void throwKind(const std::string& kind, const std::string& text) {
  if (kind == "unknown") throw UnknownSignal(text);
  if (kind == "use" || kind == "token" || kind == "protocol") throw WrongUse(text);
  if (kind == "driven") throw Driven(text);
  throw Failure(text);
}

}  // namespace qor
