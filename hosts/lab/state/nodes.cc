// The typed reads of host_state.h.

#include <charconv>

#include "hosts/lab/state/host_state.h"

namespace Lab {

namespace {

const Json* Find(const Json& state, const char* pointer) {
  const Json::json_pointer path(pointer);
  return state.contains(path) ? &state.at(path) : nullptr;
}

const Json& Need(const Json& state, const char* pointer) {
  const Json* node = Find(state, pointer);
  if (node == nullptr) throw StateError(std::string(pointer) + " is missing");
  return *node;
}

[[noreturn]] void Mistyped(const char* pointer, const char* type) {
  throw StateError(std::string(pointer) + " is not " + type);
}

std::string FromHex(const std::string& hex, const char* pointer) {
  std::string bytes;
  for (size_t i = 0; i < hex.size(); i += 2) {
    unsigned char byte = 0;
    const char* begin = hex.data() + i;
    const char* end = begin + 2;
    if (i + 1 == hex.size() || std::from_chars(begin, end, byte, 16).ptr != end) {
      Mistyped(pointer, "hexadecimal");
    }
    bytes += static_cast<char>(byte);
  }
  return bytes;
}

std::string AsText(const Json& node, const char* pointer) {
  if (node.is_string()) return node.get<std::string>();
  if (node.is_object() && node.contains("bytes")) {
    return FromHex(Text(node, "/bytes"), pointer);
  }
  Mistyped(pointer, "a text");
}

int64_t AsNumber(const Json& node, const char* pointer) {
  if (!node.is_number_integer()) Mistyped(pointer, "a whole number");
  return node.get<int64_t>();
}

bool AsFlag(const Json& node, const char* pointer) {
  if (!node.is_boolean()) Mistyped(pointer, "a flag");
  return node.get<bool>();
}

}  // namespace

std::string Text(const Json& state, const char* pointer) {
  return AsText(Need(state, pointer), pointer);
}

int64_t Number(const Json& state, const char* pointer) {
  return AsNumber(Need(state, pointer), pointer);
}

bool Flag(const Json& state, const char* pointer) { return AsFlag(Need(state, pointer), pointer); }

const Json& List(const Json& state, const char* pointer) {
  const Json& node = Need(state, pointer);
  if (!node.is_array()) Mistyped(pointer, "a list");
  return node;
}

const Json& Object(const Json& state, const char* pointer) {
  const Json& node = Need(state, pointer);
  if (!node.is_object()) Mistyped(pointer, "an object");
  return node;
}

std::string Text(const Json& state, const char* pointer, const std::string& fallback) {
  const Json* node = Find(state, pointer);
  return node != nullptr ? AsText(*node, pointer) : fallback;
}

int64_t Number(const Json& state, const char* pointer, int64_t fallback) {
  const Json* node = Find(state, pointer);
  return node != nullptr ? AsNumber(*node, pointer) : fallback;
}

bool Flag(const Json& state, const char* pointer, bool fallback) {
  const Json* node = Find(state, pointer);
  return node != nullptr ? AsFlag(*node, pointer) : fallback;
}

Json TextNode(const std::string& bytes) {
  Json text = bytes;
  try {
    (void)text.dump();
    return text;
  } catch (const Json::type_error&) {
    static constexpr char DIGITS[] = "0123456789abcdef";
    std::string hex;
    for (const char c : bytes) {
      const auto byte = static_cast<unsigned char>(c);
      hex += {DIGITS[byte >> 4], DIGITS[byte & 15]};
    }
    return Json{{"bytes", hex}};
  }
}

}  // namespace Lab
