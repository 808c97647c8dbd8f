#include "console/widgets/host_facts.h"

#include <gtest/gtest.h>
#include <syslog.h>

#include <filesystem>

#include "console/screen/screen.h"
#include "hostapi/nodeplane/exception.h"
#include "tests/support/curses_screen.h"
#include "tests/support/lab.h"
#include "tests/widgets/pane.h"

namespace Tarnel::Testing {
namespace {

using Nodeplane::Lib::NodeplaneException;

constexpr uint64_t MIB = uint64_t{1} << 20;
constexpr uint64_t GIB = MIB << 10;
constexpr uint64_t TIB = GIB << 10;
constexpr uint64_t PIB = TIB << 10;

TEST(MemorySize, IsRaisedAndGivenInTheLargestUnit) {
  const std::pair<uint64_t, const char*> rows[] = {
      {0, "0 MB"},
      {1, "256 MB"},
      {768 * MIB, "768 MB"},
      {768 * MIB + 1, "1 GB"},
      {GIB, "1 GB"},
      {GIB + 1, "1.2 GB"},
      {15 * GIB + 717 * MIB, "15.7 GB"},
      {1023 * GIB + 768 * MIB, "1023.7 GB"},
      {1023 * GIB + 768 * MIB + 1, "1 TB"},
      {TIB + 100 * GIB, "1.0 TB"},  // less than a tenth
      {1023 * PIB + 1023 * TIB, "1023.9 PB"},
  };
  for (const auto& [bytes, text] : rows) EXPECT_EQ(FormatMemorySize(bytes), text) << bytes;
}

TEST(Thumbprint, IsFoundInTheWordsOfOldAndNewTools) {
  const std::pair<const char*, const char*> rows[] = {
      {"SHA1 Fingerprint=0A:1B\n", "0A:1B"},
      {"sha1 Fingerprint= 0A:1B rest", "0A:1B"},
      {"SHA1 Fingerprint=", ""},
      {"SHA256 Fingerprint=0A", ""},
      {" SHA1 Fingerprint=0A", ""},
  };
  for (const auto& [output, value] : rows) EXPECT_EQ(ScanThumbprint(output), value) << output;
}

// One host whose state changes; each patch is put over what the ones before it left.
struct Step {
  const char* patch;
  const char* text;
  const char* picture;
};

const Step STEPS[] = {
    {"{}",
     "{ip}|{hostname}|{serial-number}|{servicetag}|{ostrelproduct}\n"
     "{ostrelversion}|{memory}|{assettag}|{BIOSversion}|{BMCversion}\n"
     "{PLSAversion}|{CPLDversion}|{supportstart}|{supportperiod}",
     "192.0.2.20|rack7.example.com|HS-0042-7719|7719|Ostrel Laboratory Host\n"
     "8.0.2 build-24022|16 GB|AT-1017 / Row 4|HBIOS (3.12) (secure)|2.61.03\n"
     "7.703.18|N/A|N/A|N/A\n"},
    // The address in effect counts, and empty texts show as such, but for the service tag.
    {R"({"network": {"kernelNics": {"core0": {"stored": {"dhcp": true, "address": null},
                                              "running": {"address": "10.0.0.9"}}},
                     "stacks": {"defaultTcpipStack": {"running": {"domain": ""}}}},
         "hardware": {"firmware": {"serviceTag": "", "serialNumber": ""}, "storage": []},
         "host": {"version": {"buildNumber": 0}},
         "programs": {"/usr/lib/halvren/openssh/bin/ssh-keygen": [
             {"args": ["-l", "-f", "/etc/ssh/ssh_host_dsa_key"],
              "stdout": "1024 SHA256:dsa lab (DSA)\n"},
             {"args": ["-l", "-f", "/etc/ssh/ssh_host_rsa_key"],
              "stdout": "  3072\t MD5:rsa lab (RSA)\n"}]}})",
     "{ip}|{hostname}|{serial-number}|{servicetag}|{PLSAversion}|{ostrelversion}\n"
     "{ssh-dsa-fingerprint}|{ssh-rsa-fingerprint}",
     "10.0.0.9|rack7.||N/A|N/A|8.0.2 build-00000\nSHA256:dsa|MD5:rsa\n"},
    {R"({"network": {"management": null},
         "host": {"version": {"buildNumber": 4294967295}},
         "hardware": {"memory": {"pages": 4294967296, "pageSize": 4096}},
         "programs": {
             "/usr/lib/halvren/openssh/bin/ssh-keygen": [{"signal": 9}],
             "/bin/openssl": [{"exit": 1, "stdout": "SHA1 Fingerprint=00:11\n"}]}})",
     "{ip}|{ostrelversion}|{memory}|{ssh-rsa-fingerprint}|{ssl-thumbprint}|",
     "0.0.0.0|8.0.2 build-4294967295|16 TB|||\n"},
    {R"({"faults": [{"operation": "SysinfoUtil::SysinfoGet", "message": "no"}],
         "programs": {"/usr/lib/halvren/openssh/bin/ssh-keygen": [{"stdout": "3072\n"}],
                      "/bin/openssl": [{"stdout": "SHA1 Fingerprint=00:11\n"}]}})",
     "{ostrelproduct}|{ostrelversion}|{ssh-rsa-fingerprint}|{ssl-thumbprint}", "|||00:11\n"},
};

TEST(Facts, TellWhatTheHostIs) {
  LoadScenario("firmware-rich");
  const CursesScreen screen(80, 4);
  Pane pane(80, 4);
  TextArea* area = pane.AddText(0, 0, 80, 4);
  for (const Step& step : STEPS) {
    SetState(step.patch);
    area->SetText(step.text);
    UpdateScreen();
    EXPECT_EQ(screen.Picture(), step.picture);
  }
}

// Unlike the version record, these are not the fact's own to explain away.
TEST(Facts, PassTheHostsFailureOn) {
  LoadScenario("sample", R"({"faults": [
      {"operation": "NetworkInfoImpl::GetManagementInterface", "message": "no"},
      {"operation": "DnsConfigImpl::GetDomain", "message": "no"},
      {"operation": "HardwareInfoImpl::GetSerialNumber", "message": "no"},
      {"operation": "HardwareService::Refresh", "message": "no", "times": 1},
      {"operation": "HardwareService::GetBiosData", "message": "no", "times": 1},
      {"operation": "HardwareService::GetBmcVersion", "message": "no"}]})");
  EXPECT_THROW(TextArea::GetIpValue(), NodeplaneException);
  EXPECT_THROW(TextArea::GetHostnameValue(), NodeplaneException);
  EXPECT_THROW(TextArea::GetSerialNumberValue(), NodeplaneException);
  for (const char* failing : {"Refresh", "GetBiosData", "GetBmcVersion"}) {
    EXPECT_THROW(TextArea::GetBMCVersion(), NodeplaneException) << failing;
  }
}

TEST(Facts, LogWhatCannotBeHad) {
  LoadScenario("firmware-rich", R"({
      "hardware": {"drivers": {"plsa": null}},
      "faults": [{"operation": "DriverService::FindDriver", "message": "no such driver", "times": 1},
                 {"operation": "DriverService::FindDriver", "returns": null}],
      "programs": {"/usr/lib/halvren/openssh/bin/ssh-keygen": [
          {"exit": 255, "stdout": "3072 SHA256:no", "stderr": "no such %s"}]}})");
  openlog("TARNEL", 0, LOG_USER);
  const Log log;
  EXPECT_EQ(TextArea::GetPLSAVersion(), "N/A");
  EXPECT_EQ(GetHardwareVersion(5), "N/A");
  EXPECT_EQ(TextArea::GetSSHRsaKeyFingerprintValue(), "");
  log.WaitFor({"user.err", "TARNEL: Get sthba0 version string failed, err=no such driver"});
  EXPECT_EQ(TextArea::GetPLSAVersion(), "N/A");
  log.WaitFor(
      {"user.err", "TARNEL: Get sthba0 version string failed, err=The host has no such driver"});
  log.WaitFor({"user.err", "TARNEL: Invalid version id: 5 requested"});
  log.WaitFor({"user.info", "TARNEL: Error generating SSH Key Fingerprint: no such %s"});
}

TEST(Facts, UnderstandTheRealTools) {
  LoadScenario("sample");
  const std::string key = TextArea::GetSSHRsaKeyFingerprintValue();
  EXPECT_TRUE(key.starts_with("SHA256:")) << key;
  EXPECT_EQ(key.size(), sizeof "SHA256:" - 1 + 43) << key;
  const std::string certificate = TextArea::GetSSLThumbprintValue();
  EXPECT_EQ(certificate.size(), 20 * 3 - 1) << certificate;
  EXPECT_EQ(certificate.find_first_not_of("0123456789ABCDEF:"), std::string::npos) << certificate;

  const std::string file = "/etc/halvren/ssl/rui.crt";
  std::filesystem::rename(file, file + ".away");
  EXPECT_EQ(TextArea::GetSSLThumbprintValue(), "");
  std::filesystem::rename(file + ".away", file);
}

TEST(Facts, AreReadAtEachRendering) {
  LoadScenario("sample", R"({"trace": {"reads": true}})");
  const CursesScreen screen(24, 2);
  Pane pane(24, 2);
  pane.AddText(0, 0, 0, 1)->SetText("{hostname}");
  EXPECT_TRUE(TraceLines().empty()) << "a window that does not fit needs no facts";

  TextArea* area = pane.AddText(0, 0, 24, 2);
  area->SetText("I am {hostname} at {ip}");
  SetState(R"({"network": {"stacks": {"defaultTcpipStack": {"running": {"hostname": "r"}}}}})");
  area->Activate(true);
  UpdateScreen();
  EXPECT_EQ(screen.Picture(), "I am r.example.com at 19\n2.0.2.20\n");

  SetState(R"({"faults": [{"operation": "DnsConfigImpl::GetHostname", "message": "no"}]})");
  EXPECT_THROW(area->Activate(true), NodeplaneException);
  pane.Refresh();
  UpdateScreen();
  EXPECT_EQ(screen.Picture(), "") << "a failure leaves the area erased";
}

}  // namespace
}  // namespace Tarnel::Testing
