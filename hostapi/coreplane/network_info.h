#pragma once

#include <memory>
#include <string>
#include <vector>

#include "hostapi/nodeplane/ip_address.h"
#include "hostapi/nodeplane/network_interface.h"
#include "hostapi/nodeplane/pci_device.h"

namespace Coreplane::Network {

// A physical network adapter, found by its name. An adapter that has vanished throws
// NodeplaneException at the first read, not at construction.
class PnicImpl {
 public:
  explicit PnicImpl(const std::string& name);
  ~PnicImpl();
  PnicImpl(PnicImpl&&) noexcept;
  PnicImpl& operator=(PnicImpl&&) noexcept;

  std::string GetName() const;
  Nodeplane::Network::MacAddress GetMacAddress() const;
  bool IsLinkUp() const;
  // The device behind the adapter; null when it is no PCI device.
  std::unique_ptr<Nodeplane::Hardware::PciDevice> GetPciDevice() const;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

// A kernel interface that can take its hardware address from an adapter.
class CoreNicImpl : public Nodeplane::Network::CoreNic {
 public:
  ~CoreNicImpl() override;

  // Gives the interface the adapter's hardware address.
  virtual void SetMacFromPnic(PnicImpl& pnic) = 0;

 protected:
  CoreNicImpl() = default;
};

// The network interfaces of the host's kernel.
class CorelinNicInfoImpl {
 public:
  CorelinNicInfoImpl();
  ~CorelinNicInfoImpl();
  CorelinNicInfoImpl(CorelinNicInfoImpl&&) noexcept;
  CorelinNicInfoImpl& operator=(CorelinNicInfoImpl&&) noexcept;

  // All of them, the management interface included.
  std::vector<std::unique_ptr<Nodeplane::Network::NetworkInterface>> GetCorelinNics() const;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

// The host's network as a whole. Every operation throws NodeplaneException when the host fails.
class NetworkInfoImpl {
 public:
  NetworkInfoImpl();
  ~NetworkInfoImpl();
  NetworkInfoImpl(NetworkInfoImpl&&) noexcept;
  NetworkInfoImpl& operator=(NetworkInfoImpl&&) noexcept;

  // IPv6 is on in the kernel as it runs now.
  bool IsCoreIpv6Enabled() const;
  // Takes effect at the next start of the host.
  void SetCoreIpv6Enabled(bool enabled);
  // Finds anew which interface is the management interface.
  void UpdateManagementInterface();
  // Null when there is none. Works without an update too.
  std::unique_ptr<Nodeplane::Network::NetworkInterface> GetManagementInterface() const;
  // All physical adapters.
  std::vector<std::unique_ptr<PnicImpl>> GetPnics() const;

  // Turns the service off that sends core dumps over the network.
  void DisableNetDumper();
  // Removes the whole network configuration: the host is out of reach afterwards.
  void ClearNetworkConfig();
  // Sets up the network as on a fresh host.
  void AutoConfigNetwork();

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

}  // namespace Coreplane::Network
