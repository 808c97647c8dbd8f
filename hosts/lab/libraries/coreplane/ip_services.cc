#include "hostapi/coreplane/ip_services.h"

#include "hosts/lab/libraries/perform.h"

namespace Coreplane::Network {

struct DnsConfigImpl::Data {
  std::string stack;

  std::string Read(const char* operation, const char* field) const {
    return Lab::PerformRead<std::string>({operation, stack}, [&](const Lab::Json& state) {
      return Lab::Text(state, ("/network/stacks/" + stack + "/running" + field).c_str());
    });
  }
};

DnsConfigImpl::DnsConfigImpl(const std::string& stack)
    : _data(std::make_unique<Data>(Data{stack})) {}
DnsConfigImpl::~DnsConfigImpl() = default;
DnsConfigImpl::DnsConfigImpl(DnsConfigImpl&&) noexcept = default;
DnsConfigImpl& DnsConfigImpl::operator=(DnsConfigImpl&&) noexcept = default;

std::string DnsConfigImpl::GetHostname() const {
  return _data->Read("DnsConfigImpl::GetHostname", "/hostname");
}

std::string DnsConfigImpl::GetDomain() const {
  return _data->Read("DnsConfigImpl::GetDomain", "/domain");
}

struct RoutingInfoImpl::Data {
  std::string stack;
};

RoutingInfoImpl::RoutingInfoImpl(const std::string& stack)
    : _data(std::make_unique<Data>(Data{stack})) {}
RoutingInfoImpl::~RoutingInfoImpl() = default;
RoutingInfoImpl::RoutingInfoImpl(RoutingInfoImpl&&) noexcept = default;
RoutingInfoImpl& RoutingInfoImpl::operator=(RoutingInfoImpl&&) noexcept = default;

}  // namespace Coreplane::Network
