#include <syslog.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <memory>

#include "console/hostops/command_runner.h"
#include "console/screen/frame.h"

namespace Tarnel {
namespace {

constexpr char STEW_CMD_PATH[] = "/bin/stew-cmd";
constexpr int32_t NOT_PERMITTED = 255;
constexpr int32_t QUERY_TIMEOUT_SECONDS = 120;

struct FreeText {
  void operator()(char* text) const { free(text); }
};

}  // namespace

const std::string TARNEL_USER = "tarnel";

int32_t RunStewCmd(const char* path, const char** argv, char* outBuf, int32_t* outLen, char* errBuf,
                   int32_t* errLen, const char* inBuf, uint32_t inLen) {
  const int32_t result = RunCommand(path, argv, outBuf, outLen, errBuf, errLen, inBuf, inLen, 0);
  if (result != NOT_PERMITTED) {
    return result;
  }
  syslog(LOG_INFO, "Unable to execute command stew-cmd %s using user %s. Using user %s", argv[3],
         argv[2], TARNEL_USER.c_str());
  argv[2] = TARNEL_USER.c_str();
  if (outLen != nullptr) {
    *outLen = 256;
  }
  if (errLen != nullptr) {
    *errLen = 256;
  }
  return RunCommand(path, argv, outBuf, outLen, errBuf, errLen, inBuf, inLen, 0);
}

int32_t RunStewCmdAsOperator(const char* command) {
  const char* argv[] = {"stew-cmd", "-U", Frame::LoginName().c_str(), command, nullptr};
  return RunStewCmd(STEW_CMD_PATH, argv, nullptr, nullptr, nullptr, nullptr, nullptr, 0);
}

bool QueryStewBool(const std::string& command) {
  const std::unique_ptr<char, FreeText> copy(strdup(command.c_str()));
  if (copy == nullptr) {
    syslog(LOG_ERR, "stew-cmd invocation failure: %s", strerror(ENOMEM));
    return false;
  }
  char output[256] = {};
  auto length = static_cast<int32_t>(sizeof output - 1);
  syslog(LOG_INFO, "stew-cmd invocation: get %s", copy.get());
  const char* argv[] = {"stew-cmd", "-U", TARNEL_USER.c_str(), copy.get(), nullptr};
  const int32_t result = RunCommand(STEW_CMD_PATH, argv, output, &length, nullptr, nullptr, nullptr,
                                    0, QUERY_TIMEOUT_SECONDS);
  output[length] = '\0';
  if (result != 0) {
    syslog(LOG_ERR, "stew-cmd invocation failure: %m");
  }
  return strncmp(output, "true", 4) == 0;
}

void StewRefresh() { RunStewCmdAsOperator("internalsvc/refresh"); }

void AutostopAndPowerOffVms(bool graceful) {
  RunStewCmdAsOperator("hostsvc/autostartmanager/autostop");
  const char* argv[] = {"powerOffVms", graceful ? nullptr : "--terminate", nullptr};
  RunCommand("/bin/powerOffVms", argv, nullptr, nullptr, nullptr, nullptr, nullptr, 0, 0);
}

}  // namespace Tarnel
