// What the network around the lab host answers: pings and names.

#include <arpa/inet.h>
#include <netdb.h>

#include <algorithm>
#include <vector>

#include "tests/hosts/lab/lab_test.h"

namespace {

class SurroundingsTest : public LabTest {};

// How /sbin/coreping ends, started without environment and standard descriptors.
std::string Ping(const std::vector<const char*>& arguments) {
  std::vector<const char*> argv = {"coreping"};
  argv.insert(argv.end(), arguments.begin(), arguments.end());
  argv.push_back(nullptr);
  const pid_t pid = fork();
  if (pid == 0) {
    for (const int fd : {0, 1, 2}) close(fd);
    char* const environment[] = {nullptr};
    execve("/sbin/coreping", const_cast<char* const*>(argv.data()), environment);
    _exit(99);
  }
  int status = 0;
  waitpid(pid, &status, 0);
  return WIFSIGNALED(status) ? "signal " + std::to_string(WTERMSIG(status))
                             : std::to_string(WEXITSTATUS(status));
}

TEST_F(SurroundingsTest, AddressesAnswerAsTheStateSays) {
  struct Row {
    const char* scenario;
    std::vector<const char*> arguments;
    const char* end;
  };
  const Row rows[] = {
      {"ping", {"192.0.2.1", "-I", "core0"}, "0"},
      {"ping", {"192.0.2.20"}, "0"},
      {"ping", {"192.0.2.9"}, "1"},
      {"ping", {"192.0.2.54"}, "1"},
      {"ping", {"192.0.2.66"}, "signal 9"},
      {"ping", {"-c1", "2001:db8:0:0::1"}, "0"},
      {"ipv6", {"fe80::1"}, "0"},
      {"ipv6", {"2001:db8::d:77"}, "0"},
      {"no-connection", {"192.0.2.1"}, "1"},
      {"ping", {"192.0.2.1", "-I", "core9"}, "2"},
      {"ping", {}, "2"},
      {"ping", {"192.0.2.1", "-x"}, "2"},
  };
  for (const auto& [scenario, arguments, end] : rows) {
    Lab::LoadScenario(scenario);
    EXPECT_EQ(Ping(arguments), end) << scenario << Lab::ReadFile("/etc/halvren/lab/trace");
  }
}

TEST_F(SurroundingsTest, APingIsLoggedAtItsEnd) {
  Lab::LoadScenario("ping");
  Ping({"192.0.2.66"});
  const std::string text = "user.info coreping: coreping 192.0.2.66 ended with signal 9 at ";
  for (int i = 0; i < 500 && Lab::ReadFile("/var/log/syslog.log").find(text) == std::string::npos;
       ++i) {
    usleep(10000);
  }
  EXPECT_NE(Lab::ReadFile("/var/log/syslog.log").find(text), std::string::npos);
  EXPECT_EQ(Lab::ReadFile("/etc/halvren/lab/trace"),
            "program /sbin/coreping coreping 192.0.2.66\n");
}

std::string AddressText(const sockaddr* address) {
  char text[INET6_ADDRSTRLEN] = "";
  const void* bytes = &reinterpret_cast<const sockaddr_in*>(address)->sin_addr;
  if (address->sa_family == AF_INET6) {
    bytes = &reinterpret_cast<const sockaddr_in6*>(address)->sin6_addr;
  }
  inet_ntop(address->sa_family, bytes, text, sizeof text);
  return text;
}

// The addresses that the C library finds for the name, in the order of their texts.
std::string Resolve(const char* name, int family) {
  addrinfo hints{};
  hints.ai_family = family;
  hints.ai_socktype = SOCK_STREAM;
  hints.ai_flags = AI_CANONNAME;
  addrinfo* found = nullptr;
  const int error = getaddrinfo(name, nullptr, &hints, &found);
  if (error != 0) return error == EAI_NONAME ? "unknown" : gai_strerror(error);
  std::vector<std::string> texts;
  for (const addrinfo* entry = found; entry != nullptr; entry = entry->ai_next) {
    texts.push_back(AddressText(entry->ai_addr));
  }
  freeaddrinfo(found);
  std::sort(texts.begin(), texts.end());
  std::string all;
  for (const std::string& text : texts) all += text + " ";
  return all;
}

TEST_F(SurroundingsTest, NamesResolveByTheState) {
  Lab::LoadScenario("names");
  std::string many;
  for (int i = 100; i < 200; ++i)
    many += (many.empty() ? "" : ",") + ("\"2001:db8::" + std::to_string(i)) + "\"";
  Patch(R"({"names": {"six.example.com": {"answers": ["2001:db8::6"]},
                      "many.example.com": {"answers": [)" +
        many + "]}}}");
  struct Row {
    const char* name;
    int family;
    const char* found;
  };
  const Row rows[] = {
      // The host's own file answers first.
      {"rack7.example.com", AF_UNSPEC, "192.0.2.20 "},
      {"localhost", AF_INET, "127.0.0.1 "},
      {"Rack7.Example.COM.", AF_INET6, "2001:db8::20 "},
      {"six.example.com", AF_UNSPEC, "2001:db8::6 "},
      {"six.example.com", AF_INET, "unknown"},
      {"lost.example.com", AF_UNSPEC, "unknown"},
      {"nowhere.example.com", AF_UNSPEC, "unknown"},
  };
  for (const auto& [name, family, found] : rows) {
    std::string result = Resolve(name, family);
    if (result == gai_strerror(EAI_NODATA) || result == gai_strerror(EAI_ADDRFAMILY)) {
      result = "unknown";
    }
    EXPECT_EQ(result, found) << name << " " << family;
  }
  // More than the first buffer of the C library holds.
  const std::string all = Resolve("many.example.com", AF_INET6);
  EXPECT_EQ(std::count(all.begin(), all.end(), ' '), 100);
  // Without the own entry the name service answers, in both families.
  Lab::ReplaceFile("/etc/hosts", "127.0.0.1 localhost\n");
  EXPECT_EQ(Resolve("rack7.example.com", AF_UNSPEC), "192.0.2.20 2001:db8::20 ");
}

}  // namespace
