// Feeds the address parsers with mutated addresses. A fault is an answer that contradicts itself,
// or whatever the sanitizers find.

#include <arpa/inet.h>

#include "fuzz/random.h"
#include "hostapi/nodeplane/exception.h"
#include "hostapi/nodeplane/ip_address.h"

namespace {

using namespace Nodeplane::Network;

constexpr int ITERATIONS = 30'000;
constexpr char ALPHABET[] = "0123456789abcdefABCDEFgx:./%-+ \t\0\x7f\xff";

const std::vector<std::string> SEEDS = {
    "192.0.2.2",    "255.255.255.0",     "010.001.000.099",  "0.0.0.0",         "2001:db8::1/64",
    "fe80::1%eth0", "::ffff:1.2.3.4",    "fe80::1%eth0/128", "1:2:3:4:5:6:7:8", "::",
    "febf::/1",     "02:fc:00:00:00:01", "FF:FF:FF:FF:FF:FF"};

std::string MakeText(Random& random) {
  std::string text = random.From(SEEDS);
  for (size_t changes = random.Below(5); changes > 0; --changes) {
    const size_t at = random.Below(text.size() + 1);
    const char character = ALPHABET[random.Below(sizeof ALPHABET - 1)];
    const size_t kind = random.Below(5);
    if (kind == 0) text.insert(at, 1, character);
    if (kind == 1) text.erase(at, 1 + random.Below(4));
    if (kind == 2) text.insert(at, text.substr(at / 2, random.Below(6)));
    if (kind == 3) text += random.From(SEEDS);
    if (kind == 4 && at < text.size()) text[at] = character;
  }
  return text;
}

// Checks what holds for every parser; gives whether the text was an address.
template <typename Address>
bool Check(const std::string& text, bool valid) {
  try {
    const Address address(text);
    Require(valid, "the constructor takes only what the check takes", text);
    const Address again(address.GetStringAddress());
    Require(again == address, "the text form is the same address", text);
    Require(again.GetStringAddress() == address.GetStringAddress(), "one text form", text);
  } catch (const Nodeplane::Lib::NodeplaneException&) {
    Require(!valid, "the constructor takes what the check takes", text);
  }
  return valid;
}

bool CLibraryTakes(int family, const std::string& text) {
  in6_addr address{};
  return text.find('\0') == std::string::npos && inet_pton(family, text.c_str(), &address) == 1;
}

int CheckAll(const std::string& text) {
  const bool v4 = Check<Ipv4Address>(text, Ipv4Address::IsValidAddress(text));
  const bool v6 = Check<Ipv6Address>(text, Ipv6Address::IsValidAddress(text));
  const bool network = Check<Ipv6Network>(text, Ipv6Network::IsValidAddressAndNetmask(text));
  const bool mac = Check<MacAddress>(text, MacAddress::IsValidAddress(text));
  Require(v4 || !CLibraryTakes(AF_INET, text), "what the C library takes is IPv4", text);
  Require(v6 || !CLibraryTakes(AF_INET6, text), "what the C library takes is IPv6", text);
  Require(v4 + v6 + network + mac <= 1, "one kind of address at once", text);
  return v4 + v6 + network + mac;
}

}  // namespace

int main() {
  Random random;
  int valid = 0;
  for (int i = 0; i < ITERATIONS; ++i) valid += CheckAll(MakeText(random));
  printf("%d inputs, %d of them addresses\n", ITERATIONS, valid);
  // Inputs that are all refused, or all taken, would try nothing.
  return valid > ITERATIONS / 20 && valid < ITERATIONS * 19 / 20 ? EXIT_SUCCESS : EXIT_FAILURE;
}
