#pragma once

#include <memory>

namespace Coreplane::Network {

// The virtual switches of the host. Every operation throws NodeplaneException when the host fails.
class VirtualSwitchInfoImpl {
 public:
  VirtualSwitchInfoImpl();
  ~VirtualSwitchInfoImpl();
  VirtualSwitchInfoImpl(VirtualSwitchInfoImpl&&) noexcept;
  VirtualSwitchInfoImpl& operator=(VirtualSwitchInfoImpl&&) noexcept;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

}  // namespace Coreplane::Network
