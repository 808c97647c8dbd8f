// The two ways to the advanced options from a command line: one reads, the other writes.

#include <charconv>

#include "hosts/lab/programs/host/program.h"

namespace Lab::Host {

namespace {

Json::json_pointer PointerTo(const std::string& option) {
  return Json::json_pointer("/options/advanced") / option;
}

bool Exists(const std::string& option) { return ReadState()->contains(PointerTo(option)); }

Outcome NoSuchOption(const std::string& option) {
  return {1, "", "Unknown advanced option " + option + "\n"};
}

}  // namespace

Outcome AdvancedConfig(const Words& words) {
  if (words.size() != 4 || words[1] != "-q" || words[2] != "-g") {
    return {1, "", "usage: ostrelcfg-advcfg -q -g OPTION\n"};
  }
  if (!Exists(words[3])) return NoSuchOption(words[3]);
  const Json value = ReadState()->at(PointerTo(words[3]) / "value");
  return {0, (value.is_string() ? value.get<std::string>() : value.dump()) + "\n"};
}

Outcome SettingsTool(const Words& words) {
  static const Words SUBCOMMAND = {"system", "settings", "advanced", "set"};
  if (words.size() != 9 || !std::equal(SUBCOMMAND.begin(), SUBCOMMAND.end(), words.begin() + 1) ||
      words[5] != "-o" || words[7] != "-i") {
    return {1, "", "usage: " + words[0] + " system settings advanced set -o OPTION -i NUMBER\n"};
  }
  const std::string& option = words[6];
  const std::string& text = words[8];
  if (!Exists(option)) return NoSuchOption(option);
  int64_t value = 0;
  const char* const end = text.data() + text.size();
  if (std::from_chars(text.data(), end, value).ptr != end || text.empty()) {
    return {1, "", "Not a number: " + text + "\n"};
  }
  ChangeState([&](Json& state) { state[PointerTo(option) / "value"] = value; });
  return {};
}

}  // namespace Lab::Host
