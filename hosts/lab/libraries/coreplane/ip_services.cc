#include "hostapi/coreplane/ip_services.h"

#include <algorithm>

#include "hosts/lab/libraries/perform.h"

namespace Coreplane::Network {

using Lab::Json;
using Nodeplane::Network::IpAddress;
using Nodeplane::Network::Ipv4Address;
using Nodeplane::Network::Ipv6Address;

namespace {

// A view of a TCP/IP stack, "running" or "stored":
//   {hostname, domain, suffixes[], gateway4, gateway6, dns4[], dns6[], dns6FromDhcp[]}
std::string ViewPointer(const std::string& stack, const char* view) {
  return "/network/stacks/" + stack + "/" + view;
}

const Json& Running(const Json& state, const std::string& stack) {
  return Lab::Object(state, ViewPointer(stack, "running").c_str());
}

// The view to change; the stack must be there.
Json& View(Json& state, const std::string& stack, const char* view) {
  Lab::Object(state, ViewPointer(stack, view).c_str());
  return state[Json::json_pointer(ViewPointer(stack, view))];
}

template <class Address>
std::vector<Address> Addresses(const Json& view, const char* list) {
  std::vector<Address> addresses;
  for (const Json& text : view.value(list, Json::array())) {
    addresses.push_back(Address(Lab::Text(text, "")));
  }
  return addresses;
}

// Without a gateway the node is empty, null or missing.
template <class Address>
Address Gateway(const Json& view, const char* field) {
  const Json node = view.value(field, Json());
  const std::string text = node.is_null() ? "" : Lab::Text(node, "");
  return text.empty() ? Address() : Address(text);
}

const char* FlagText(bool flag) { return flag ? "true" : "false"; }

// Words between blanks and commas.
std::vector<std::string> Words(const std::string& text) {
  constexpr char SEPARATORS[] = " \t\n\v\f\r,";
  std::vector<std::string> words;
  for (size_t start = 0; (start = text.find_first_not_of(SEPARATORS, start)) != text.npos;) {
    const size_t end = std::min(text.find_first_of(SEPARATORS, start), text.size());
    words.push_back(text.substr(start, end - start));
    start = end;
  }
  return words;
}

void AddOnce(Json& list, const std::string& text) {
  if (std::find(list.begin(), list.end(), text) == list.end()) list.push_back(text);
}

}  // namespace

struct DnsConfigImpl::Data {
  std::string stack;

  template <class Result, class Effect>
  Result Read(const char* operation, Effect effect) const {
    return Lab::PerformRead<Result>(
        {operation, stack}, [&](const Json& state) { return effect(Running(state, stack)); });
  }

  template <class Effect>
  void Change(const char* operation, std::vector<std::string> arguments, Effect effect) {
    Lab::PerformChange({operation, stack, std::move(arguments)},
                       [&](Json& state) { effect(View(state, stack, "running")); });
  }
};

DnsConfigImpl::DnsConfigImpl(const std::string& stack)
    : _data(std::make_unique<Data>(Data{stack})) {}
DnsConfigImpl::~DnsConfigImpl() = default;
DnsConfigImpl::DnsConfigImpl(DnsConfigImpl&&) noexcept = default;
DnsConfigImpl& DnsConfigImpl::operator=(DnsConfigImpl&&) noexcept = default;

std::string DnsConfigImpl::GetHostname() const {
  return _data->Read<std::string>("DnsConfigImpl::GetHostname",
                                  [](const Json& view) { return Lab::Text(view, "/hostname"); });
}

std::string DnsConfigImpl::GetDomain() const {
  return _data->Read<std::string>("DnsConfigImpl::GetDomain",
                                  [](const Json& view) { return Lab::Text(view, "/domain"); });
}

std::vector<std::string> DnsConfigImpl::GetSearchDomains() const {
  using Domains = std::vector<std::string>;
  return _data->Read<Domains>("DnsConfigImpl::GetSearchDomains", [](const Json& view) {
    Domains domains;
    for (const Json& domain : Lab::List(view, "/suffixes")) {
      domains.push_back(Lab::Text(domain, ""));
    }
    return domains;
  });
}

std::vector<Ipv4Address> DnsConfigImpl::GetNameServers() const {
  return _data->Read<std::vector<Ipv4Address>>(
      "DnsConfigImpl::GetNameServers",
      [](const Json& view) { return Addresses<Ipv4Address>(view, "dns4"); });
}

std::vector<Ipv6Address> DnsConfigImpl::GetIpv6NameServers(bool onlyFromDhcp) const {
  return _data->Read<std::vector<Ipv6Address>>(
      "DnsConfigImpl::GetIpv6NameServers", [onlyFromDhcp](const Json& view) {
        return Addresses<Ipv6Address>(view, onlyFromDhcp ? "dns6FromDhcp" : "dns6");
      });
}

void DnsConfigImpl::SetHostname(const std::string& hostname, bool fromDhcp) {
  _data->Change("DnsConfigImpl::SetHostname", {hostname, FlagText(fromDhcp)},
                [&](Json& view) { view["hostname"] = Lab::TextNode(hostname); });
}

void DnsConfigImpl::SetFqdn(const std::string& fqdn, bool fromDhcp, const std::string& domain) {
  _data->Change("DnsConfigImpl::SetFqdn", {fqdn, FlagText(fromDhcp), domain}, [&](Json& view) {
    const size_t dot = std::min(fqdn.find('.'), fqdn.size());
    const std::string rest = dot < fqdn.size() ? fqdn.substr(dot + 1) : "";
    view["hostname"] = Lab::TextNode(fqdn.substr(0, dot));
    view["domain"] = Lab::TextNode(domain.empty() ? rest : domain);
  });
}

void DnsConfigImpl::RemoveNameServers() {
  _data->Change("DnsConfigImpl::RemoveNameServers", {}, [](Json& view) {
    for (const char* list : {"dns4", "dns6", "dns6FromDhcp"}) view[list] = Json::array();
  });
}

void DnsConfigImpl::AddNameServer(const IpAddress& address) {
  const std::string text = address.GetStringAddress();
  const char* list = address.GetFamily() == IpAddress::IPV6 ? "dns6" : "dns4";
  _data->Change("DnsConfigImpl::AddNameServer", {text},
                [&](Json& view) { AddOnce(view[list], text); });
}

void DnsConfigImpl::SetSearchDomainsString(const std::string& domains) {
  _data->Change("DnsConfigImpl::SetSearchDomainsString", {domains}, [&](Json& view) {
    view["suffixes"] = Json::array();
    for (const std::string& domain : Words(domains)) AddOnce(view["suffixes"], domain);
  });
}

// A domain that is there already stays where it is; else every save would make the list longer.
void DnsConfigImpl::AddSearchDomain(const std::string& domain) {
  _data->Change("DnsConfigImpl::AddSearchDomain", {domain},
                [&](Json& view) { AddOnce(view["suffixes"], domain); });
}

void DnsConfigImpl::SaveConfig() {
  Lab::PerformChange({"DnsConfigImpl::SaveConfig", _data->stack}, [this](Json& state) {
    const Json running = View(state, _data->stack, "running");
    for (const char* field : {"hostname", "domain", "suffixes", "dns4", "dns6"}) {
      View(state, _data->stack, "stored")[field] = running.at(field);
    }
  });
}

struct RoutingInfoImpl::Data {
  std::string stack;

  template <class Address>
  Address Read(const char* operation, const char* field) const {
    return Lab::PerformRead<Address>({operation, stack}, [&](const Json& state) {
      return Gateway<Address>(Running(state, stack), field);
    });
  }

  // An address that is all zeros means none.
  void Change(const Lab::Call& call, const char* field, const std::string& gateway, bool stored) {
    const bool none = gateway == "0.0.0.0" || gateway == "::";
    Lab::PerformChange(call, [&](Json& state) {
      View(state, stack, "running")[field] = none ? "" : gateway;
      if (stored) View(state, stack, "stored")[field] = none ? "" : gateway;
    });
  }
};

RoutingInfoImpl::RoutingInfoImpl(const std::string& stack)
    : _data(std::make_unique<Data>(Data{stack})) {}
RoutingInfoImpl::~RoutingInfoImpl() = default;
RoutingInfoImpl::RoutingInfoImpl(RoutingInfoImpl&&) noexcept = default;
RoutingInfoImpl& RoutingInfoImpl::operator=(RoutingInfoImpl&&) noexcept = default;

Ipv4Address RoutingInfoImpl::GetCorelinDefaultGateway() const {
  return _data->Read<Ipv4Address>("RoutingInfoImpl::GetCorelinDefaultGateway", "gateway4");
}

Ipv6Address RoutingInfoImpl::GetIpv6CorelinDefaultGateway() const {
  return _data->Read<Ipv6Address>("RoutingInfoImpl::GetIpv6CorelinDefaultGateway", "gateway6");
}

void RoutingInfoImpl::SetCorelinDefaultGateway(const Ipv4Address& gateway, bool fromDhcp) {
  const std::string text = gateway.GetStringAddress();
  _data->Change(
      {"RoutingInfoImpl::SetCorelinDefaultGateway", _data->stack, {text, FlagText(fromDhcp)}},
      "gateway4", text, !fromDhcp);
}

void RoutingInfoImpl::SetIpv6CorelinDefaultGateway(const Ipv6Address& gateway) {
  const std::string text = gateway.GetScopedStringAddress();
  _data->Change({"RoutingInfoImpl::SetIpv6CorelinDefaultGateway", _data->stack, {text}}, "gateway6",
                text, true);
}

}  // namespace Coreplane::Network
