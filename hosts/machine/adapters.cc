#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <system_error>

#include "hosts/machine/pci_address.h"
#include "hosts/machine/readers.h"
#include "hosts/machine/text_file.h"

namespace Machine {

namespace {

namespace fs = std::filesystem;

// ARPHRD_ETHER, as the kernel writes it.
constexpr char ETHERNET[] = "1";

std::string Attribute(const fs::path& link, const char* name) {
  return ReadFirstLine((link / name).string());
}

bool IsEthernet(const fs::path& link) { return Attribute(link, "type") == ETHERNET; }

bool HasDevice(const fs::path& link) {
  std::error_code error;
  return fs::exists(link / "device", error);
}

// One end of a pair whose other end lies outside, as containers have it: the kernel gives it the
// index of that end. Bridges, VLANs and their like tell their kind.
bool LeadsOutside(const fs::path& link) {
  const std::string uevent = ReadText((link / "uevent").string());
  return uevent.find("DEVTYPE=") == std::string::npos &&
         Attribute(link, "iflink") != Attribute(link, "ifindex");
}

// The address of the PCI device below which the adapter sits; a virtio adapter is its child.
std::string FindPciAddress(const fs::path& link) {
  std::error_code error;
  const fs::path device = fs::canonical(link / "device", error);
  std::string address;
  for (const fs::path& part : device) {
    if (IsPciAddress(part.string())) address = part.string();
  }
  return address;
}

Adapter ReadAdapter(const fs::path& link) {
  return {link.filename().string(), Attribute(link, "address"), Attribute(link, "carrier") == "1",
          FindPciAddress(link)};
}

std::vector<fs::path> ListEthernetLinks(const std::string& directory) {
  std::vector<fs::path> links;
  for (const std::string& name : ListDirectory(directory)) {
    const fs::path link = fs::path(directory) / name;
    if (IsEthernet(link)) links.push_back(link);
  }
  const auto index = [](const fs::path& link) { return atoi(Attribute(link, "ifindex").c_str()); };
  std::stable_sort(links.begin(), links.end(), [&](const fs::path& left, const fs::path& right) {
    return index(left) < index(right);
  });
  return links;
}

std::vector<Adapter> Select(const std::vector<fs::path>& links, bool (*wanted)(const fs::path&)) {
  std::vector<Adapter> adapters;
  for (const fs::path& link : links) {
    if (wanted(link)) adapters.push_back(ReadAdapter(link));
  }
  return adapters;
}

}  // namespace

std::vector<Adapter> ReadAdapters(const Sources& sources) {
  const std::vector<fs::path> links = ListEthernetLinks(sources.root + "/sys/class/net");
  std::vector<Adapter> adapters = Select(links, HasDevice);
  return adapters.empty() ? Select(links, LeadsOutside) : adapters;
}

}  // namespace Machine
