#include "console/widgets/host_facts.h"

#include <strings.h>
#include <syslog.h>

#include <array>
#include <cstring>
#include <sstream>
#include <string_view>

#include "console/hostops/command_runner.h"
#include "console/widgets/text_area.h"
#include "hostapi/coreplane/hardware.h"
#include "hostapi/coreplane/ip_services.h"
#include "hostapi/kernel.h"
#include "hostapi/nodeplane/exception.h"
#include "hostapi/nodeplane/host.h"
#include "hostapi/nodeplane/ip_address.h"

namespace Tarnel {

using Nodeplane::Lib::NodeplaneException;
using Nodeplane::Misc::StrPrintf;

namespace {

constexpr char NOT_AVAILABLE[] = "N/A";
constexpr char sshKeygenPath[] = "/usr/lib/halvren/openssh/bin/ssh-keygen";
constexpr char STORAGE_ADAPTER[] = "sthba0";
constexpr size_t TOOL_OUTPUT = 255;

struct ToolResult {
  int32_t exitCode;
  std::string output;
  std::string errors;
};

ToolResult RunTool(const char* path, const char** argv) {
  std::array<char, TOOL_OUTPUT> output;
  std::array<char, TOOL_OUTPUT> errors;
  int32_t outLen = TOOL_OUTPUT;
  int32_t errLen = TOOL_OUTPUT;
  const int32_t exitCode =
      RunCommand(path, argv, output.data(), &outLen, errors.data(), &errLen, nullptr, 0, 0);
  return {exitCode, std::string(output.data(), static_cast<size_t>(outLen)),
          std::string(errors.data(), static_cast<size_t>(errLen))};
}

std::string KeyFingerprint(const char* keyFile) {
  const char* argv[] = {"ssh-keygen", "-l", "-f", keyFile, nullptr};
  const ToolResult result = RunTool(sshKeygenPath, argv);
  if (result.exitCode != 0) {
    syslog(LOG_INFO, "Error generating SSH Key Fingerprint: %s", result.errors.c_str());
    return {};
  }
  std::istringstream words(result.output);
  std::string size;
  std::string fingerprint;
  words >> size >> fingerprint;
  return fingerprint;
}

SystemVersionRecord ReadVersionRecord() {
  SystemVersionRecord record{};
  Coreplane::Util::SysinfoUtil::SysinfoGet(SYSNODE_NODE_system_version, &record, sizeof record,
                                           nullptr);
  return record;
}

template <size_t SIZE>
std::string FieldText(const char (&field)[SIZE]) {
  return {field, strnlen(field, SIZE)};
}

std::string StorageDriverVersion(Nodeplane::Host& host) {
  try {
    for (const auto& adapter : host.GetStorageService().GetAdapters()) {
      if (adapter == nullptr || adapter->GetName() != STORAGE_ADAPTER) continue;
      const auto driver = host.GetDriverService().FindDriver(adapter->GetDriverName());
      if (driver == nullptr) throw NodeplaneException("The host has no such driver");
      return driver->GetVersion();
    }
  } catch (const NodeplaneException& error) {
    syslog(LOG_ERR, "Get %s version string failed, err=%s", STORAGE_ADAPTER, error.what());
  }
  return NOT_AVAILABLE;
}

std::string BiosVersion(const Nodeplane::Hardware::BiosData& bios) {
  return StrPrintf("%s (%d.%d) %s", bios.versionName.c_str(), bios.majorNumber, bios.minorNumber,
                   bios.versionSuffix.c_str());
}

}  // namespace

const std::string& GetProductLine() {
  static std::string line;
  if (line.empty()) {
    const SystemVersionRecord record = ReadVersionRecord();
    line = FieldText(record.productName) + " " + FieldText(record.version) + " (Corelin " +
           FieldText(record.releaseType) + " Build " + FieldText(record.buildText) + ")";
  }
  return line;
}

std::string FormatMemorySize(uint64_t bytes) {
  constexpr uint64_t STEP = uint64_t{1} << 28;
  constexpr std::string_view UNITS = "MGTP";
  const uint64_t rounded = (bytes + STEP - 1) & ~(STEP - 1);
  size_t unit = 0;
  uint64_t divisor = uint64_t{1} << 20;
  while (unit + 1 < UNITS.size() && rounded >= divisor << 10) {
    divisor <<= 10;
    ++unit;
  }
  std::string text = std::to_string(rounded / divisor);
  const uint64_t rest = rounded % divisor;
  if (rest != 0) text += "." + std::to_string(rest * 10 / divisor);
  return text + " " + UNITS[unit] + "B";
}

std::string GetHardwareVersion(int versionId) {
  const auto host = Nodeplane::HostFactory::GetHost();
  Nodeplane::Hardware::HardwareService& hardware = host->GetHardwareService();
  hardware.Refresh();
  const Nodeplane::Hardware::BiosData bios = hardware.GetBiosData();
  switch (versionId) {
    case STORAGE_DRIVER_VERSION:
      return StorageDriverVersion(*host);
    case BMC_VERSION:
      return hardware.GetBmcVersion();
    case BIOS_VERSION:
      return BiosVersion(bios);
    case ASSET_TAG:
      return bios.assetTag;
    default:
      syslog(LOG_ERR, "Invalid version id: %d requested", versionId);
      return NOT_AVAILABLE;
  }
}

std::string ScanThumbprint(const std::string& output) {
  // Newer tools write the name of the hash in lower case.
  constexpr std::string_view PREFIX = "SHA1 Fingerprint=";
  if (strncasecmp(output.c_str(), PREFIX.data(), PREFIX.size()) != 0) return {};
  std::istringstream rest(output.substr(PREFIX.size()));
  std::string fingerprint;
  rest >> fingerprint;
  return fingerprint;
}

std::string TextArea::GetIpValue() {
  Nodeplane::Network::Ipv4Address address("0.0.0.0");
  const auto interface = LookupManagementInterface();
  if (interface != nullptr) address = interface->GetRunningIpConfig().GetIpv4Address();
  return address.GetStringAddress();
}

std::string TextArea::GetSSLThumbprintValue() {
  const char* argv[] = {"openssl", "x509",         "-in",   "/etc/halvren/ssl/rui.crt",
                        "-noout",  "-fingerprint", "-sha1", nullptr};
  const ToolResult result = RunTool("/bin/openssl", argv);
  return result.exitCode == 0 ? ScanThumbprint(result.output) : "";
}

std::string TextArea::GetSSHDsaKeyFingerprintValue() {
  return KeyFingerprint("/etc/ssh/ssh_host_dsa_key");
}

std::string TextArea::GetSSHRsaKeyFingerprintValue() {
  return KeyFingerprint("/etc/ssh/ssh_host_rsa_key");
}

std::string TextArea::GetSerialNumberValue() {
  return Coreplane::Hardware::HardwareInfoImpl().GetSerialNumber();
}

std::string TextArea::GetHostnameValue() {
  const Coreplane::Network::DnsConfigImpl dns(Coreplane::Network::DEFAULT_STACK);
  const std::string hostname = dns.GetHostname();
  return hostname + "." + dns.GetDomain();
}

std::string TextArea::GetOstrelProduct() {
  try {
    return FieldText(ReadVersionRecord().productName);
  } catch (const NodeplaneException&) {
    return {};
  }
}

std::string TextArea::GetOstrelVersion() {
  try {
    const SystemVersionRecord record = ReadVersionRecord();
    return FieldText(record.version) + " build-" + StrPrintf("%05u", record.buildNumber);
  } catch (const NodeplaneException&) {
    return {};
  }
}

std::string TextArea::GetSupportStart() { return NOT_AVAILABLE; }

std::string TextArea::GetSupportPeriod() { return NOT_AVAILABLE; }

std::string TextArea::GetSystemMemory() {
  const Coreplane::Hardware::MemoryInfoImpl memory;
  const auto pages = memory.GetTotalPages();
  return FormatMemorySize(pages * memory.GetPageSize());
}

std::string TextArea::GetServiceTag() {
  const std::string tag = Coreplane::Hardware::HardwareInfoImpl().GetServiceTag();
  return tag.empty() ? NOT_AVAILABLE : tag;
}

std::string TextArea::GetAssetTag() { return GetHardwareVersion(ASSET_TAG); }

std::string TextArea::GetBIOSVersion() { return GetHardwareVersion(BIOS_VERSION); }

std::string TextArea::GetBMCVersion() { return GetHardwareVersion(BMC_VERSION); }

std::string TextArea::GetCPLDVersion() { return NOT_AVAILABLE; }

std::string TextArea::GetPLSAVersion() { return GetHardwareVersion(STORAGE_DRIVER_VERSION); }

}  // namespace Tarnel
