#include <sys/utsname.h>
#include <unistd.h>

#include <charconv>
#include <set>

#include "hosts/machine/readers.h"
#include "hosts/machine/text_file.h"

namespace Machine {

namespace {

struct Entry {
  std::string key;
  std::string value;
};

// The "key : value" lines of files such as /proc/cpuinfo.
std::vector<Entry> ReadEntries(const std::string& path) {
  std::vector<Entry> entries;
  for (const std::string& line : ReadLines(path)) {
    const std::string_view text = line;
    const size_t colon = text.find(':');
    if (colon == std::string_view::npos) continue;
    entries.push_back(
        {std::string(Trim(text.substr(0, colon))), std::string(Trim(text.substr(colon + 1)))});
  }
  return entries;
}

std::string FindValue(const std::vector<Entry>& entries, std::string_view key) {
  for (const Entry& entry : entries) {
    if (entry.key == key && !entry.value.empty()) return entry.value;
  }
  return {};
}

std::string ArchitectureName() {
  utsname system{};
  return uname(&system) == 0 ? std::string(system.machine) + " processor" : "Processor";
}

// Each architecture has its own key for what a person would call the processor.
std::string FindModel(const std::vector<Entry>& cpuinfo) {
  for (const char* key : {"model name", "cpu model", "cpu", "Model", "Hardware", "uarch"}) {
    std::string model = FindValue(cpuinfo, key);
    if (!model.empty()) return model;
  }
  return ArchitectureName();
}

}  // namespace

Processor ReadProcessor(const Sources& sources) {
  const std::vector<Entry> cpuinfo = ReadEntries(sources.root + "/proc/cpuinfo");
  std::set<std::string> packages;
  for (const Entry& entry : cpuinfo) {
    if (entry.key == "physical id") packages.insert(entry.value);
  }
  return {FindModel(cpuinfo), packages.empty() ? 1 : static_cast<int>(packages.size())};
}

Memory ReadMemory(const Sources& sources) {
  Memory memory;
  const long pageSize = sysconf(_SC_PAGESIZE);
  if (pageSize > 0) memory.pageSize = static_cast<uint64_t>(pageSize);
  const std::string total = FindValue(ReadEntries(sources.root + "/proc/meminfo"), "MemTotal");
  uint64_t kilobytes = 0;
  std::from_chars(total.data(), total.data() + total.size(), kilobytes);
  memory.totalBytes = kilobytes * 1024;
  return memory;
}

Firmware ReadFirmware(const Sources& sources) {
  const std::string tables = sources.root + "/sys/class/dmi/id/";
  Firmware firmware;
  firmware.vendor = ReadFirstLine(tables + "sys_vendor");
  firmware.product = ReadFirstLine(tables + "product_name");
  firmware.serialNumber = ReadFirstLine(tables + "product_serial");
  firmware.uuid = ReadFirstLine(tables + "product_uuid");
  firmware.assetTag = ReadFirstLine(tables + "chassis_asset_tag");
  firmware.biosVendor = ReadFirstLine(tables + "bios_vendor");
  firmware.biosVersion = ReadFirstLine(tables + "bios_version");
  firmware.biosDate = ReadFirstLine(tables + "bios_date");
  return firmware;
}

}  // namespace Machine
