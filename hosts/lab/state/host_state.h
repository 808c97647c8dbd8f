#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <nlohmann/json.hpp>
#include <stdexcept>
#include <string>

// The laboratory host's state: one JSON document that the host libraries and the programs of a lab
// share. Whoever changes it replaces the file as a whole under the lab's lock, so that a reader
// always sees a complete document and needs no lock.
namespace Lab {

using Json = nlohmann::json;

// Where a lab keeps its state, below its own root.
inline constexpr char LAB_DIRECTORY[] = "/etc/halvren/lab";

// The state cannot be read or written, or a node of it is missing or of the wrong type. The text
// names the file or the node.
class StateError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// The state as of now. It is parsed again only when the file has changed.
std::shared_ptr<const Json> ReadState();

// Applies a change to the current state and stores the result. No other change comes in between.
// When the change throws, nothing is stored.
void ChangeState(const std::function<void(Json&)>& change);

// Typed reads of a node by its JSON pointer, such as "/hardware/cpu/model". They throw StateError
// when the node is missing or of another type.
//
// A text may also stand as {"bytes": "c328"}, hexadecimal, for what JSON cannot hold.
std::string Text(const Json& state, const char* pointer);
int64_t Number(const Json& state, const char* pointer);
bool Flag(const Json& state, const char* pointer);
const Json& List(const Json& state, const char* pointer);
const Json& Object(const Json& state, const char* pointer);

// The same with a value for a missing node; a node of another type still throws.
std::string Text(const Json& state, const char* pointer, const std::string& fallback);
int64_t Number(const Json& state, const char* pointer, int64_t fallback);
bool Flag(const Json& state, const char* pointer, bool fallback);

// The bytes as a node that Text() gives back.
Json TextNode(const std::string& bytes);

}  // namespace Lab
