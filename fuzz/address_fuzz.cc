// Feeds the address parsers with mutated addresses. A fault is an answer that contradicts itself,
// or whatever the sanitizers find. The same inputs come in every run.

#include <arpa/inet.h>

#include <cstdio>
#include <cstdlib>
#include <random>
#include <string>
#include <vector>

#include "hostapi/nodeplane/exception.h"
#include "hostapi/nodeplane/ip_address.h"

namespace {

using namespace Nodeplane::Network;

constexpr int ITERATIONS = 50'000;
constexpr char ALPHABET[] = "0123456789abcdefABCDEFgx:./%-+ \t\0\x7f\xff";

const std::vector<std::string> SEEDS = {
    "192.0.2.2",    "255.255.255.0",     "010.001.000.099",  "0.0.0.0",         "2001:db8::1/64",
    "fe80::1%eth0", "::ffff:1.2.3.4",    "fe80::1%eth0/128", "1:2:3:4:5:6:7:8", "::",
    "febf::/1",     "02:fc:00:00:00:01", "FF:FF:FF:FF:FF:FF"};

class Mutator {
 public:
  std::string Next() {
    std::string text = SEEDS[Below(SEEDS.size())];
    for (size_t changes = Below(5); changes > 0; --changes) Change(text);
    return text;
  }

 private:
  size_t Below(size_t limit) { return _random() % limit; }

  void Change(std::string& text) {
    const size_t at = Below(text.size() + 1);
    const char character = ALPHABET[Below(sizeof ALPHABET - 1)];
    switch (Below(5)) {
      case 0:
        text.insert(at, 1, character);
        break;
      case 1:
        text.erase(at, 1 + Below(4));
        break;
      case 2:
        text.insert(at, text.substr(at / 2, Below(6)));
        break;
      case 3:
        text.append(SEEDS[Below(SEEDS.size())]);
        break;
      default:
        if (at < text.size()) text[at] = character;
    }
  }

  std::mt19937 _random{20};
};

[[noreturn]] void Fail(const char* rule, const std::string& text) {
  fprintf(stderr, "%s:", rule);
  for (const char character : text) fprintf(stderr, " %02x", static_cast<unsigned char>(character));
  fprintf(stderr, "\n");
  exit(1);
}

// Checks what holds for every parser; gives whether the text was an address.
template <typename Address>
bool Check(const std::string& text, bool valid) {
  try {
    const Address address(text);
    if (!valid) Fail("constructor takes what the check refuses", text);
    const Address again(address.GetStringAddress());
    if (!(again == address)) Fail("text form is another address", text);
    if (again.GetStringAddress() != address.GetStringAddress()) Fail("text form changes", text);
  } catch (const Nodeplane::Lib::NodeplaneException&) {
    if (valid) Fail("check takes what the constructor refuses", text);
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
  if (CLibraryTakes(AF_INET, text) && !v4) Fail("IPv4 address refused", text);
  if (CLibraryTakes(AF_INET6, text) && !v6) Fail("IPv6 address refused", text);
  if (v4 + v6 + network + mac > 1) Fail("two kinds of address at once", text);
  return v4 + v6 + network + mac;
}

}  // namespace

int main() {
  Mutator mutator;
  int valid = 0;
  for (int i = 0; i < ITERATIONS; ++i) valid += CheckAll(mutator.Next());
  printf("%d inputs, %d of them addresses\n", ITERATIONS, valid);
  // Inputs that are all refused, or all taken, would try nothing.
  return valid > ITERATIONS / 20 && valid < ITERATIONS * 19 / 20 ? 0 : 1;
}
