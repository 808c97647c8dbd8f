#include "widgets/host_facts.h"

#include <gtest/gtest.h>
#include <syslog.h>

#include <filesystem>
#include <ostream>
#include <vector>

#include "hostapi/nodeplane/exception.h"
#include "shell/colours.h"
#include "shell/screen.h"
#include "tests/support/curses_screen.h"
#include "tests/support/lab.h"
#include "widgets/text_area.h"

namespace Tarnel::Testing {
namespace {

using Nodeplane::Lib::NodeplaneException;

constexpr uint64_t MIB = uint64_t{1} << 20;
constexpr uint64_t GIB = MIB << 10;
constexpr uint64_t TIB = GIB << 10;
constexpr uint64_t PIB = TIB << 10;

struct MemoryCase {
  uint64_t bytes;
  const char* text;
};

TEST(MemorySize, IsRaisedAndGivenInTheLargestUnit) {
  const MemoryCase table[] = {
      {0, "0 MB"},
      {1, "256 MB"},
      {256 * MIB, "256 MB"},
      {256 * MIB + 1, "512 MB"},
      {768 * MIB, "768 MB"},
      {768 * MIB + 1, "1 GB"},
      {GIB, "1 GB"},
      {GIB + 1, "1.2 GB"},
      {GIB + 512 * MIB, "1.5 GB"},
      {15 * GIB + 717 * MIB, "15.7 GB"},
      {16 * GIB - 4096, "16 GB"},
      {1023 * GIB + 768 * MIB, "1023.7 GB"},
      {1023 * GIB + 768 * MIB + 1, "1 TB"},
      {TIB + 100 * GIB, "1.0 TB"},  // less than a tenth
      {TIB + 103 * GIB, "1.1 TB"},
      {PIB - 1, "1 PB"},
      {1023 * PIB + 1023 * TIB, "1023.9 PB"},
  };
  for (const MemoryCase& row : table) {
    EXPECT_EQ(FormatMemorySize(row.bytes), row.text) << row.bytes;
  }
}

TEST(Thumbprint, IsFoundInTheWordsOfOldAndNewTools) {
  EXPECT_EQ(ScanThumbprint("SHA1 Fingerprint=0A:1B\n"), "0A:1B");
  EXPECT_EQ(ScanThumbprint("sha1 Fingerprint=0A:1B\n"), "0A:1B");
  EXPECT_EQ(ScanThumbprint("SHA1 Fingerprint= 0A:1B rest"), "0A:1B");
  for (const char* const output :
       {"", "SHA1", "SHA1 Fingerprint=", "SHA256 Fingerprint=0A", " SHA1 Fingerprint=0A"}) {
    EXPECT_EQ(ScanThumbprint(output), "") << output;
  }
}

struct Fact {
  std::string (*read)();
  const char* value;
};

struct HostCase {
  const char* name;
  const char* scenario;
  const char* patch;
  std::vector<Fact> facts;
};

std::ostream& operator<<(std::ostream& out, const HostCase& row) {
  return out << row.scenario << " " << row.patch;
}

class FactTable : public testing::TestWithParam<HostCase> {};

TEST_P(FactTable, TellsWhatTheHostIs) {
  LoadScenario(GetParam().scenario, GetParam().patch);
  for (const Fact& fact : GetParam().facts) EXPECT_EQ(fact.read(), fact.value);
}

INSTANTIATE_TEST_SUITE_P(
    , FactTable,
    testing::Values(
        HostCase{"Sample",
                 "sample",
                 "",
                 {{TextArea::GetIpValue, "192.0.2.20"},
                  {TextArea::GetSerialNumberValue, "HS-0042-7719"},
                  {TextArea::GetServiceTag, "7719"},
                  {TextArea::GetHostnameValue, "rack7.example.com"},
                  {TextArea::GetOstrelProduct, "Ostrel Laboratory Host"},
                  {TextArea::GetOstrelVersion, "8.0.2 build-24022"},
                  {TextArea::GetSystemMemory, "16 GB"},
                  {TextArea::GetPLSAVersion, "N/A"},
                  {TextArea::GetCPLDVersion, "N/A"},
                  {TextArea::GetSupportStart, "N/A"},
                  {TextArea::GetSupportPeriod, "N/A"}}},
        HostCase{"Firmware",
                 "firmware-rich",
                 "",
                 {{TextArea::GetAssetTag, "AT-1017 / Row 4"},
                  {TextArea::GetBIOSVersion, "HBIOS (3.12) (secure)"},
                  {TextArea::GetBMCVersion, "2.61.03"},
                  {TextArea::GetPLSAVersion, "7.703.18"}}},
        HostCase{"NoInterface", "no-management", "", {{TextArea::GetIpValue, "0.0.0.0"}}},
        HostCase{"AddressInEffect",
                 "sample",
                 R"({"network": {"kernelNics": {"core0": {
                     "stored": {"dhcp": true, "address": null},
                     "running": {"address": "10.0.0.9"}}}}})",
                 {{TextArea::GetIpValue, "10.0.0.9"}}},
        HostCase{"EmptyTexts",
                 "sample",
                 R"({"hardware": {"firmware": {"serviceTag": "", "serialNumber": ""}},
                     "network": {"stacks": {"defaultTcpipStack": {"running": {"domain": ""}}}},
                     "host": {"version": {"buildNumber": 0}}})",
                 {{TextArea::GetServiceTag, "N/A"},
                  {TextArea::GetSerialNumberValue, ""},
                  {TextArea::GetHostnameValue, "rack7."},
                  {TextArea::GetOstrelVersion, "8.0.2 build-00000"}}},
        HostCase{"LargeNumbers",
                 "sample",
                 R"({"host": {"version": {"buildNumber": 4294967295}},
                     "hardware": {"memory": {"pages": 4294967296, "pageSize": 4096}}})",
                 {{TextArea::GetOstrelVersion, "8.0.2 build-4294967295"},
                  {TextArea::GetSystemMemory, "16 TB"}}},
        HostCase{"SmallBuild",
                 "sample",
                 R"({"host": {"version": {"buildNumber": 123}}})",
                 {{TextArea::GetOstrelVersion, "8.0.2 build-00123"}}},
        HostCase{"NoVersionRecord",
                 "sample",
                 R"({"faults": [{"operation": "SysinfoUtil::SysinfoGet", "message": "no"}]})",
                 {{TextArea::GetOstrelProduct, ""}, {TextArea::GetOstrelVersion, ""}}},
        HostCase{"KeyTool",
                 "sample",
                 R"({"programs": {"/usr/lib/halvren/openssh/bin/ssh-keygen": [
                     {"args": ["-l", "-f", "/etc/ssh/ssh_host_dsa_key"],
                      "stdout": "1024 SHA256:dsa lab (DSA)\n"},
                     {"args": ["-l", "-f", "/etc/ssh/ssh_host_rsa_key"],
                      "stdout": "  3072\t MD5:rsa lab (RSA)\n"}]}})",
                 {{TextArea::GetSSHDsaKeyFingerprintValue, "SHA256:dsa"},
                  {TextArea::GetSSHRsaKeyFingerprintValue, "MD5:rsa"}}},
        HostCase{
            "ToolsThatSayNothing",
            "sample",
            R"({"programs": {
                     "/usr/lib/halvren/openssh/bin/ssh-keygen": [{"stdout": "3072\n"}],
                     "/bin/openssl": [{"stdout": ""}]}})",
            {{TextArea::GetSSHRsaKeyFingerprintValue, ""}, {TextArea::GetSSLThumbprintValue, ""}}},
        HostCase{
            "ToolsThatFail",
            "sample",
            R"({"programs": {
                     "/usr/lib/halvren/openssh/bin/ssh-keygen": [{"signal": 9}],
                     "/bin/openssl": [{"exit": 1, "stdout": "SHA1 Fingerprint=00:11\n"}]}})",
            {{TextArea::GetSSHRsaKeyFingerprintValue, ""}, {TextArea::GetSSLThumbprintValue, ""}}}),
    [](const auto& row) { return row.param.name; });

struct FailureCase {
  const char* operation;
  std::string (*read)();
};

// Unlike the version record, these are not the fact's own to explain away.
TEST(Facts, PassTheHostsFailureOn) {
  const FailureCase table[] = {
      {"NetworkInfoImpl::GetManagementInterface", TextArea::GetIpValue},
      {"DnsConfigImpl::GetDomain", TextArea::GetHostnameValue},
      {"HardwareInfoImpl::GetSerialNumber", TextArea::GetSerialNumberValue},
      {"HardwareService::Refresh", TextArea::GetPLSAVersion},
      {"HardwareService::GetBiosData", TextArea::GetBIOSVersion},
      {"HardwareService::GetBmcVersion", TextArea::GetBMCVersion},
  };
  for (const FailureCase& row : table) {
    LoadScenario("sample", std::string(R"({"faults": [{"operation": ")") + row.operation +
                               R"(", "message": "out of order"}]})");
    EXPECT_THROW(row.read(), NodeplaneException) << row.operation;
  }
}

TEST(Facts, LogsADriverThatIsNotThere) {
  LoadScenario("firmware-rich", R"({"hardware": {"drivers": {"plsa": null}},
      "faults": [{"operation": "DriverService::FindDriver", "message": "no such driver"}]})");
  openlog("TARNEL", 0, LOG_USER);
  const Log log;
  EXPECT_EQ(TextArea::GetPLSAVersion(), "N/A");
  log.WaitFor({"user.err", "TARNEL: Get sthba0 version string failed, err=no such driver"});
}

TEST(Facts, LogsAnUnknownHardwareVersion) {
  LoadScenario("firmware-rich");
  openlog("TARNEL", 0, LOG_USER);
  const Log log;
  for (const int id : {0, 5, -1}) {
    EXPECT_EQ(GetHardwareVersion(id), "N/A");
    log.WaitFor({"user.err", "TARNEL: Invalid version id: " + std::to_string(id) + " requested"});
  }
}

// A file of the host that is away for as long as the object lives.
class WithoutFile {
 public:
  explicit WithoutFile(std::string path) : _path(std::move(path)) {
    std::filesystem::rename(_path, _path + ".away");
  }
  ~WithoutFile() { std::filesystem::rename(_path + ".away", _path); }
  WithoutFile(const WithoutFile&) = delete;
  WithoutFile& operator=(const WithoutFile&) = delete;

 private:
  std::string _path;
};

TEST(Fingerprints, OfTheCertificate) {
  LoadScenario("sample");
  const std::string value = TextArea::GetSSLThumbprintValue();
  EXPECT_EQ(value.size(), 20 * 3 - 1) << value;
  EXPECT_EQ(value.find_first_not_of("0123456789ABCDEF:"), std::string::npos) << value;
  const WithoutFile noCertificate("/etc/halvren/ssl/rui.crt");
  EXPECT_EQ(TextArea::GetSSLThumbprintValue(), "");
}

TEST(Fingerprints, OfAHostKey) {
  LoadScenario("sample");
  const std::string value = TextArea::GetSSHRsaKeyFingerprintValue();
  EXPECT_TRUE(value.starts_with("SHA256:")) << value;
  EXPECT_EQ(value.size(), sizeof "SHA256:" - 1 + 43) << value;
}

TEST(Fingerprints, FailureOfTheKeyToolIsLogged) {
  LoadScenario("sample", R"({"programs": {"/usr/lib/halvren/openssh/bin/ssh-keygen": [
      {"exit": 255, "stdout": "3072 SHA256:no", "stderr": "no such %s"}]}})");
  openlog("TARNEL", 0, LOG_USER);
  const Log log;
  EXPECT_EQ(TextArea::GetSSHRsaKeyFingerprintValue(), "");
  log.WaitFor({"user.info", "TARNEL: Error generating SSH Key Fingerprint: no such %s"});
}

class Pane : public Window {
 public:
  Pane() : Window(0, 0, 24, 2, LIGHT_GREY, BLACK) { Activate(true); }
};

TEST(Facts, AreReadAtEachRendering) {
  LoadScenario("sample");
  const CursesScreen screen(24, 2);
  Pane pane;
  auto* area = pane.Add<TextArea>(0, 0, 24, 2, PARENT_COLOUR);
  area->SetText("I am {hostname} at {ip}");
  SetState(R"({"network": {"stacks": {"defaultTcpipStack": {"running": {"hostname": "r"}}}}})");
  area->Activate(true);
  UpdateScreen();
  EXPECT_EQ(screen.Picture(), "I am r.example.com at 19\n2.0.2.20\n");
}

TEST(Facts, AreNotReadForAWindowThatDoesNotFit) {
  LoadScenario("sample", R"({"trace": {"reads": true}})");
  const CursesScreen screen(24, 2);
  Pane pane;
  pane.Add<TextArea>(0, 0, 0, 1, PARENT_COLOUR)->SetText("{hostname}");
  EXPECT_TRUE(TraceLines().empty());
}

TEST(Facts, FailureLeavesTheAreaErased) {
  LoadScenario("sample");
  const CursesScreen screen(24, 2);
  Pane pane;
  auto* area = pane.Add<TextArea>(0, 0, 24, 1, PARENT_COLOUR);
  area->SetText("I am {hostname}");
  SetState(R"({"faults": [{"operation": "DnsConfigImpl::GetHostname", "message": "no"}]})");
  EXPECT_THROW(area->Activate(true), NodeplaneException);
  pane.Refresh();
  UpdateScreen();
  EXPECT_EQ(screen.Picture(), "");
}

}  // namespace
}  // namespace Tarnel::Testing
