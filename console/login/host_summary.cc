#include "console/login/host_summary.h"

#include <algorithm>
#include <cmath>

#include "console/hostops/command_runner.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

namespace {

using Nodeplane::Misc::StrPrintf;
using Nodeplane::Network::Ipv6Network;

constexpr int TEXT_DOWNLOAD = 141;
constexpr int TEXT_DHCP = 261;
constexpr int TEXT_STATIC = 262;
constexpr int TEXT_AUTOCONF = 263;
constexpr int TEXT_WAITING_FOR_DHCP = 264;
constexpr int NO_TEXT = 3;

// More addresses than this are cut down to the fewer ones.
constexpr size_t MAX_IPV6_LINES = 5;
constexpr size_t FEWER_IPV6_LINES = 4;

std::string InParentheses(const char* text) {
  return *text == '\0' ? "" : std::string("(") + text + ")";
}

int Ipv4OriginText(const ManagementAddresses& addresses) {
  if (!addresses.useDhcp) {
    return addresses.ipv4None ? NO_TEXT : TEXT_STATIC;
  }
  if (addresses.dhcpLease) {
    return TEXT_DHCP;
  }
  return addresses.DhcpFailed() ? TEXT_WAITING_FOR_DHCP : NO_TEXT;
}

int Ipv6OriginText(const Ipv6Network& network) {
  switch (network.GetIpv6AddressType()) {
    case Ipv6Network::STATIC:
      return TEXT_STATIC;
    case Ipv6Network::DHCP:
      return TEXT_DHCP;
    case Ipv6Network::AUTOCONF:
      return TEXT_AUTOCONF;
    default:
      return NO_TEXT;
  }
}

std::string Ipv6Lines(const std::vector<Ipv6Network>& networks, StringFactory& strings) {
  const size_t shown = networks.size() == MAX_IPV6_LINES
                           ? MAX_IPV6_LINES
                           : std::min(networks.size(), FEWER_IPV6_LINES);
  std::vector<std::string> lines;
  for (size_t i = 0; i < shown; ++i) {
    lines.push_back("http://[" + networks[i].GetAddress().GetStringAddress() + "]/ " +
                    InParentheses(strings.GetString(Ipv6OriginText(networks[i]))) + "\n");
  }
  std::stable_sort(
      lines.begin(), lines.end(),
      [](const std::string& left, const std::string& right) { return left.size() < right.size(); });
  std::string text;
  for (const std::string& line : lines) {
    text += line;
  }
  return shown < networks.size() ? text + "...\n" : text;
}

}  // namespace

bool ManagementAddresses::DhcpFailed() const {
  return useDhcp && !dhcpLease && ipv4.GetBinaryAddress() != 0;
}

std::string AddressText(const ManagementAddresses& addresses, const std::string& hostname,
                        bool ipv6Enabled, StringFactory& strings) {
  std::string text = strings.GetString(TEXT_DOWNLOAD);
  if (!hostname.empty() && hostname != "localhost") {
    text += "\nhttp://" + hostname + "/ ";
  }
  if (!addresses.ipv4None) {
    text += "\nhttp://" + addresses.ipv4.GetStringAddress() + "/ ";
  }
  text += InParentheses(strings.GetString(Ipv4OriginText(addresses)));
  if (ipv6Enabled) {
    text += "\n" + Ipv6Lines(addresses.ipv6, strings);
  }
  return text;
}

std::string MachineName(const std::string& vendor, const std::string& product) {
  const std::string vendorName = CollapseWhitespace(vendor);
  const std::string productName = CollapseWhitespace(product);
  return productName.starts_with(vendorName) ? productName : vendorName + " " + productName;
}

std::string CpuLine(int packages, const std::string& model) {
  const std::string name = CollapseWhitespace(model);
  return packages >= 2 ? std::to_string(packages) + " x " + name : name;
}

std::string MemoryLine(uint64_t totalBytes) {
  constexpr char UNITS[] = "MGTP";
  constexpr int LARGEST = 3;
  int unit = 0;
  while (unit < LARGEST && totalBytes >> (10 * (unit + 3)) != 0) {
    ++unit;
  }
  const auto divisor = static_cast<float>(uint64_t{1} << (10 * (unit + 2)));
  const float number = std::roundf(static_cast<float>(totalBytes) * 10 / divisor) / 10;
  return StrPrintf("%g %ciB Memory", static_cast<double>(number), UNITS[unit]);
}

}  // namespace Tarnel
