#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>

#include "hostapi/nodeplane/network_interface.h"

namespace Tarnel {

// The fixed account under which the console calls the management agent when it does not act for
// the operator.
extern const std::string TARNEL_USER;
// PAM service name.
inline constexpr char TARNEL_APP[] = "tarnel";
// Advanced option that holds the idle limit of the console, in seconds.
extern const std::string TARNEL_TIMEOUT_VAR;

// Runs a program to its end and gives its exit code, 0 to 255, or -1 when it could not be started,
// was killed, or ran longer than timeoutSeconds (0 or less: no limit).
//
// argv is null-terminated; entry 0 is the program's short name. outBuf and errBuf, where given,
// receive at most *outLen and *errLen bytes, without a terminator, and the lengths become what was
// stored; the rest of the output is dropped. inBuf, where given, is the child's standard input.
int32_t RunCommand(const char* path, const char** argv, char* outBuf, int32_t* outLen, char* errBuf,
                   int32_t* errLen, const char* inBuf, uint32_t inLen, int32_t timeoutSeconds);

// Runs a command of the shell to its end, on the console's own descriptors and in its environment.
// Gives the wait status, or -1 when the shell could not be started.
int RunShell(const char* command);

// Reads until size bytes have come or the end of file; gives the number of bytes read, also when
// an error ended the reading.
int32_t ReadFully(int fd, char* buffer, int32_t size);

// RunCommand without a limit for the management agent's client. argv has the form "stew-cmd",
// "-U", user, command, null. When the user may not run it (exit code 255), it is run once more as
// TARNEL_USER, whose name then stands in argv; for that run the capacities are 256.
int32_t RunStewCmd(const char* path, const char** argv, char* outBuf, int32_t* outLen, char* errBuf,
                   int32_t* errLen, const char* inBuf, uint32_t inLen);

// RunStewCmd for a command of the management agent on behalf of the operator, whatever it prints.
int32_t RunStewCmdAsOperator(const char* command);

// Asks the management agent a question; false also when there is no answer within 120 seconds.
bool QueryStewBool(const std::string& command);

// Has the management agent read the host anew, on behalf of the operator.
void StewRefresh();

// Stops the virtual machines; without grace they are terminated.
void AutostopAndPowerOffVms(bool graceful);

// The idle limit of the console in seconds; 600 when it cannot be read.
int32_t GetTarnelTimeoutValue();
// Stores the idle limit; a failure is silent.
void SetTarnelTimeoutValue(int32_t seconds);

// Without white space at the ends, and with one blank for each run of white space inside.
std::string CollapseWhitespace(const std::string& text);

// The management interface as of now, null when there is none. Throws NodeplaneException when the
// host fails.
std::unique_ptr<Nodeplane::Network::NetworkInterface> LookupManagementInterface();

// Checks a password and the account behind it. Gives the PAM code, 0 for success.
int PamAuthenticate(const std::string& user, const std::string& password);

// True when every step of the change succeeded.
bool PamChangePassword(const std::string& user, const std::string& oldPassword,
                       const std::string& newPassword);

}  // namespace Tarnel
