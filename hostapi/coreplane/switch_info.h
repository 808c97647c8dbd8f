#pragma once

#include <memory>
#include <string>
#include <vector>

#include "hostapi/nodeplane/lattice.h"
#include "hostapi/nodeplane/virtual_switch.h"

// Every operation throws NodeplaneException when the host fails.
namespace Coreplane::Network {

// The virtual switches of the host.
class VirtualSwitchInfoImpl {
 public:
  VirtualSwitchInfoImpl();
  ~VirtualSwitchInfoImpl();
  VirtualSwitchInfoImpl(VirtualSwitchInfoImpl&&) noexcept;
  VirtualSwitchInfoImpl& operator=(VirtualSwitchInfoImpl&&) noexcept;

  // All standard switches.
  std::vector<std::unique_ptr<Nodeplane::Network::VirtualSwitch>> GetVirtualSwitches() const;
  // All distributed switches.
  std::vector<std::unique_ptr<Nodeplane::Network::LatticeSwitch>> GetLatticeSwitches() const;
  // Creates a standard switch; throws when the name is taken.
  std::unique_ptr<Nodeplane::Network::VirtualSwitch> AddVirtualSwitch(const std::string& name,
                                                                      unsigned int ports);

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

class PortsetImpl {
 public:
  // The host has a standard switch of this name.
  static bool IsValidVirtualSwitch(const std::string& name);
};

class PortGroupImpl {
 public:
  // The host has a port group of this name.
  static bool IsValidPortGroup(const std::string& name);
};

// A port that this host can make and remove by itself.
class LatticePortImpl : public Nodeplane::Network::LatticePort {
 public:
  ~LatticePortImpl() override;

  // Creates a port with this key.
  static std::unique_ptr<LatticePortImpl> CreateLatticePort(
      const Nodeplane::Network::LatticePortParam& param, const std::string& key);
  // Removes the port from the host.
  virtual void Destroy() = 0;

 protected:
  LatticePortImpl() = default;
};

}  // namespace Coreplane::Network
