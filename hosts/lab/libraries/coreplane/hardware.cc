#include "hostapi/coreplane/hardware.h"

#include "hosts/lab/libraries/perform.h"

namespace Coreplane::Hardware {

using Lab::Json;
using Nodeplane::Hardware::SmartCardSlot;
using Nodeplane::Hardware::SmartCardToken;

// The lab reads every fact from its state when it is asked for; the objects hold nothing.
struct HardwareInfoImpl::Data {};
struct CpuInfoImpl::Data {};
struct MemoryInfoImpl::Data {};
struct SmartCardInfoImpl::Data {};

namespace {

std::string ReadText(const char* operation, const char* pointer) {
  return Lab::PerformRead<std::string>(
      {operation}, [pointer](const Json& state) { return Lab::Text(state, pointer); });
}

int64_t ReadNumber(const char* operation, const char* pointer) {
  return Lab::PerformRead<int64_t>(
      {operation}, [pointer](const Json& state) { return Lab::Number(state, pointer); });
}

const Json& CardSlots(const Json& state) { return Lab::List(state, "/hardware/cardSlots"); }

std::vector<std::string> Texts(const Json& parent, const char* pointer) {
  std::vector<std::string> texts;
  for (const Json& text : Lab::List(parent, pointer)) texts.push_back(Lab::Text(text, ""));
  return texts;
}

}  // namespace

HardwareInfoImpl::HardwareInfoImpl() = default;
HardwareInfoImpl::~HardwareInfoImpl() = default;
HardwareInfoImpl::HardwareInfoImpl(HardwareInfoImpl&&) noexcept = default;
HardwareInfoImpl& HardwareInfoImpl::operator=(HardwareInfoImpl&&) noexcept = default;

std::string HardwareInfoImpl::GetVendorName() const {
  return ReadText("HardwareInfoImpl::GetVendorName", "/hardware/firmware/vendor");
}

std::string HardwareInfoImpl::GetProductName() const {
  return ReadText("HardwareInfoImpl::GetProductName", "/hardware/firmware/product");
}

std::string HardwareInfoImpl::GetSerialNumber() const {
  return ReadText("HardwareInfoImpl::GetSerialNumber", "/hardware/firmware/serialNumber");
}

std::string HardwareInfoImpl::GetServiceTag() const {
  return ReadText("HardwareInfoImpl::GetServiceTag", "/hardware/firmware/serviceTag");
}

CpuInfoImpl::CpuInfoImpl() = default;
CpuInfoImpl::~CpuInfoImpl() = default;
CpuInfoImpl::CpuInfoImpl(CpuInfoImpl&&) noexcept = default;
CpuInfoImpl& CpuInfoImpl::operator=(CpuInfoImpl&&) noexcept = default;

int CpuInfoImpl::GetNumCpuPackages() const {
  return static_cast<int>(ReadNumber("CpuInfoImpl::GetNumCpuPackages", "/hardware/cpu/packages"));
}

std::string CpuInfoImpl::GetModelName() const {
  return ReadText("CpuInfoImpl::GetModelName", "/hardware/cpu/model");
}

MemoryInfoImpl::MemoryInfoImpl() = default;
MemoryInfoImpl::~MemoryInfoImpl() = default;
MemoryInfoImpl::MemoryInfoImpl(MemoryInfoImpl&&) noexcept = default;
MemoryInfoImpl& MemoryInfoImpl::operator=(MemoryInfoImpl&&) noexcept = default;

uint64_t MemoryInfoImpl::GetTotalPages() const {
  return static_cast<uint64_t>(
      ReadNumber("MemoryInfoImpl::GetTotalPages", "/hardware/memory/pages"));
}

uint64_t MemoryInfoImpl::GetPageSize() const {
  return static_cast<uint64_t>(
      ReadNumber("MemoryInfoImpl::GetPageSize", "/hardware/memory/pageSize"));
}

SmartCardInfoImpl::SmartCardInfoImpl() = default;
SmartCardInfoImpl::~SmartCardInfoImpl() = default;
SmartCardInfoImpl::SmartCardInfoImpl(SmartCardInfoImpl&&) noexcept = default;
SmartCardInfoImpl& SmartCardInfoImpl::operator=(SmartCardInfoImpl&&) noexcept = default;

std::vector<SmartCardSlot> SmartCardInfoImpl::GetAllSlots() const {
  return Lab::PerformRead<std::vector<SmartCardSlot>>(
      {"SmartCardInfoImpl::GetAllSlots"}, [](const Json& state) {
        std::vector<SmartCardSlot> slots(CardSlots(state).size());
        for (size_t i = 0; i < slots.size(); ++i) slots[i].number = static_cast<int>(i);
        return slots;
      });
}

bool SmartCardInfoImpl::GetToken(const SmartCardSlot& slot, SmartCardToken& token) const {
  return Lab::PerformRead<bool>({"SmartCardInfoImpl::GetToken", std::to_string(slot.number)},
                                [&](const Json& state) {
                                  const Json& slots = CardSlots(state);
                                  const auto index = static_cast<size_t>(slot.number);
                                  if (index >= slots.size()) throw Lab::StateError("no such slot");
                                  if (!slots[index].contains("ids")) return false;
                                  token = {};
                                  token.userIds = Texts(slots[index], "/ids");
                                  return true;
                                });
}

}  // namespace Coreplane::Hardware
