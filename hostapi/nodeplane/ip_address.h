#pragma once

#include <array>
#include <cstdint>
#include <string>

namespace Nodeplane::Network {

// An address of either family.
class IpAddress {
 public:
  // What GetFamily() gives.
  enum Family { IPV4 = 0, IPV6 = 1 };

  virtual ~IpAddress();

  // The address in its usual text form, without a scope.
  virtual std::string GetStringAddress() const = 0;
  virtual int GetFamily() const = 0;

 protected:
  IpAddress() = default;
  IpAddress(const IpAddress&) = default;
  IpAddress& operator=(const IpAddress&) = default;
};

class Ipv4Address : public IpAddress {
 public:
  // 0.0.0.0
  Ipv4Address();
  // Takes what IsValidAddress() accepts; throws NodeplaneException for anything else.
  explicit Ipv4Address(const std::string& text);

  // Four decimal numbers of one to three digits, 0 to 255 each, with dots between them.
  static bool IsValidAddress(const std::string& text);

  // The address as one number in host byte order: 10.0.0.1 is 0x0A000001.
  uint32_t GetBinaryAddress() const;
  // 1 to 32 leading ones and only zeros behind them.
  bool IsValidNetmask() const;

  std::string GetStringAddress() const override;
  int GetFamily() const override;

 private:
  uint32_t _address = 0;
};

class Ipv6Address : public IpAddress {
 public:
  using Bytes = std::array<uint8_t, 16>;

  // ::
  Ipv6Address();
  // Takes what IsValidAddress() accepts; throws NodeplaneException for anything else.
  explicit Ipv6Address(const std::string& text);

  // Any text form of RFC 4291, with an optional "%scope" behind it.
  static bool IsValidAddress(const std::string& text);

  // The sixteen bytes in network order.
  const Bytes& GetBinaryAddress() const;
  // In fe80::/10, by the first ten bits.
  bool IsLinkLocal() const;

  // The shortest form (RFC 5952), without the scope.
  std::string GetStringAddress() const override;
  // The same with "%scope" behind it when the address has one.
  std::string GetScopedStringAddress() const;
  int GetFamily() const override;

 private:
  Bytes _address{};
  std::string _scope;
};

// An IPv6 address together with the length of its network's prefix.
class Ipv6Network {
 public:
  // Where an address comes from. A host may give other values too.
  enum AddressType { STATIC = 0, AUTOCONF = 7, DHCP = 9 };
  // How far an address reaches. A host may give other values too.
  enum Scope { LINK_LOCAL = 1, GLOBAL = 3 };

  // Takes what IsValidAddressAndNetmask() accepts; throws NodeplaneException for anything else.
  // The type is STATIC; the scope is LINK_LOCAL for a link-local address and GLOBAL for others.
  explicit Ipv6Network(const std::string& text);

  // "address/prefix" with a valid address and a prefix of 1 to 128.
  static bool IsValidAddressAndNetmask(const std::string& text);

  const Ipv6Address& GetAddress() const;
  // Length of the prefix in bits.
  int GetPrefix() const;
  // "address/prefix"
  std::string GetStringAddress() const;

  // An AddressType.
  int GetIpv6AddressType() const;
  void SetIpv6AddressType(int type);
  // A Scope.
  int GetIpv6Scope() const;
  void SetIpv6Scope(int scope);

 private:
  Ipv6Address _address;
  int _prefix = 128;
  int _type = STATIC;
  int _scope = GLOBAL;
};

// The hardware address of an Ethernet interface.
class MacAddress {
 public:
  // 00:00:00:00:00:00
  MacAddress();
  // Six pairs of hexadecimal digits with colons between them; throws NodeplaneException for
  // anything else.
  explicit MacAddress(const std::string& text);

  static bool IsValidAddress(const std::string& text);

  // Lower case, "02:fc:00:00:00:01".
  std::string GetStringAddress() const;

 private:
  std::array<uint8_t, 6> _address{};
};

bool operator==(const Ipv4Address& left, const Ipv4Address& right);
// The sixteen bytes; the scope has no say.
bool operator==(const Ipv6Address& left, const Ipv6Address& right);
// Address and prefix; type and scope have no say.
bool operator==(const Ipv6Network& left, const Ipv6Network& right);
bool operator==(const MacAddress& left, const MacAddress& right);

}  // namespace Nodeplane::Network
