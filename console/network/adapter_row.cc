#include "console/network/adapter_row.h"

#include <cstdlib>
#include <optional>
#include <string_view>

namespace Tarnel {

namespace {

constexpr char ELLIPSIS[] = "...";

std::optional<long> PnicNumber(const std::string& name) {
  constexpr std::string_view PREFIX = "upnic";
  if (!name.starts_with(PREFIX)) {
    return std::nullopt;
  }
  const char* const digits = name.c_str() + PREFIX.size();
  char* end = nullptr;
  const long number = strtol(digits, &end, 10);
  return end == digits ? std::nullopt : std::optional(number);
}

// The whole text when it is shorter than the limit, else its first characters.
std::string CutEnd(const std::string& text, size_t limit, size_t kept) {
  return text.size() < limit ? text : text.substr(0, kept) + ELLIPSIS;
}

// The end of a hardware address tells more than its start, which is the vendor's.
std::string CutMac(const std::string& mac, size_t labelLength) {
  constexpr size_t LIMIT = 26;  // of label and hardware address together
  if (labelLength + mac.size() < LIMIT) {
    return mac;
  }
  const size_t kept = LIMIT - 1 - (sizeof ELLIPSIS - 1) - labelLength;
  return ELLIPSIS + mac.substr(mac.size() - kept);
}

}  // namespace

bool ComparePnicNames(const std::string& a, const std::string& b) {
  const std::optional<long> numberA = PnicNumber(a);
  const std::optional<long> numberB = PnicNumber(b);
  return numberA && numberB ? *numberA < *numberB : a < b;
}

std::string FormatAdapterRow(const std::string& name, const std::string& label,
                             const std::string& mac, const std::string& status,
                             const std::string& usedBy) {
  const std::string shortLabel = CutEnd(label, 15, 11);
  return "{align:padding:13}" + CutEnd(name, 12, 8) + "{/align}{align:padding:30}" + shortLabel +
         " (" + CutMac(mac, shortLabel.size()) + "){/align}" + status + " " +
         (usedBy.empty() ? "" : "(...)");
}

}  // namespace Tarnel
