#include "console/network/test_children.h"

#include <netdb.h>
#include <syslog.h>
#include <unistd.h>

#include <boost/filesystem.hpp>
#include <csignal>

#include "console/screen/screen.h"
#include "hostapi/coreplane/ip_services.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

namespace {

constexpr char PING_PATH[] = "/sbin/coreping";
constexpr char HOSTS[] = "/etc/hosts";
constexpr char HOSTS_BACKUP[] = "/etc/hosts.backup";

pid_t Fork() {
  UpdateScreen();
  return fork();
}

// A program begins with nothing blocked and nothing ignored.
void ResetSignals() {
  for (int number = 1; number < NSIG; ++number) {
    signal(number, SIG_DFL);
  }
  sigset_t none;
  sigemptyset(&none);
  sigprocmask(SIG_SETMASK, &none, nullptr);
}

bool BackUpHosts() {
  try {
    boost::filesystem::copy_file(HOSTS, HOSTS_BACKUP);
    return true;
  } catch (const boost::filesystem::filesystem_error& error) {
    syslog(LOG_INFO, "failed to backup /etc/hosts: %s", error.what());
    return false;
  }
}

void RestoreHosts() {
  try {
    boost::filesystem::remove(HOSTS);
    boost::filesystem::rename(HOSTS_BACKUP, HOSTS);
  } catch (const boost::filesystem::filesystem_error& error) {
    syslog(LOG_INFO, "failed to restore /etc/hosts: %s", error.what());
  }
}

bool IsResolvable(const std::string& hostname) {
  addrinfo hints{};
  hints.ai_flags = AI_CANONNAME | AI_ADDRCONFIG;
  addrinfo* addresses = nullptr;
  if (getaddrinfo(hostname.c_str(), nullptr, &hints, &addresses) != 0) {
    return false;
  }
  freeaddrinfo(addresses);
  return true;
}

// The file is back in its place also when the name cannot be taken out of it.
bool Resolve(const std::string& hostname) {
  if (!BackUpHosts()) {
    return false;
  }
  bool resolved = false;
  try {
    Coreplane::Network::HostsFile().RemoveEntryByHostName(hostname);
    resolved = IsResolvable(hostname);
  } catch (const Nodeplane::Lib::NodeplaneException&) {
    resolved = false;
  }
  RestoreHosts();
  return resolved;
}

}  // namespace

pid_t StartPing(const std::string& address, const std::string& interface) {
  const char* const argv[] = {"coreping", address.c_str(), interface.empty() ? nullptr : "-I",
                              interface.c_str(), nullptr};
  const char* const environment[] = {nullptr};
  const pid_t pid = Fork();
  if (pid != 0) {
    return pid;
  }
  ResetSignals();
  for (const int fd : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
    close(fd);
  }
  execve(PING_PATH, const_cast<char* const*>(argv), const_cast<char* const*>(environment));
  _exit(1);
}

pid_t StartResolve(const std::string& hostname) {
  // The signals that end the console stay blocked: a child that they ended would leave the file as
  // it is while the name is looked up.
  const pid_t pid = Fork();
  if (pid != 0) {
    return pid;
  }
  _exit(Resolve(hostname) ? 0 : 1);
}

}  // namespace Tarnel
