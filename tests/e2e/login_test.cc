// An operator logs in, works the menu and logs out.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <cstring>
#include <fstream>

#include "tests/support/descriptor.h"
#include "tests/support/lab.h"
#include "tests/support/terminal.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

constexpr char EMPTY_FIELD[] = "[                                ]";
constexpr char PASSWORD[] = "laboratory";
constexpr char MENU[] = "<Up/Down> Select";

void OpenLogin(Terminal& terminal) {
  // A line that an earlier screen has covered. The last draw of this one drops keys.
  terminal.WaitFor("Halden Core 6214 CPU");
  terminal.Settle();
  terminal.Type(F2);
  terminal.WaitFor("<Esc> Cancel");
  terminal.Settle();
}

void LogIn(Terminal& terminal, const std::string& user, const std::string& password) {
  OpenLogin(terminal);
  terminal.Type(user);
  terminal.Type("\t" + password + ENTER);
}

std::vector<std::string> Events() {
  std::ifstream file("/var/log/notaryd.log");
  std::vector<std::string> events;
  for (std::string line; std::getline(file, line);) events.push_back(line);
  return events;
}

TEST(LoginDialog, ShowsItsFieldsAndModes) {
  LoadScenario("smart-card");
  Terminal terminal;
  OpenLogin(terminal);
  terminal.WaitFor("Enter the smart card login PIN for");
  terminal.WaitFor("Login Id:          [ root ");
  terminal.WaitFor("<F3> Switch PIN/Password Login");
  terminal.Type("other\tsecret");
  terminal.WaitFor("[ ******");
  terminal.Type(F3);
  terminal.WaitFor("Login Name:        [ root ");
  terminal.WaitFor(EMPTY_FIELD);
  EXPECT_TRUE(terminal.CursorVisible());
  terminal.Type(ESC);
  terminal.WaitFor("Halden Core 6214 CPU");
  terminal.Settle();
  EXPECT_FALSE(terminal.CursorVisible());
}

// The row of the list that is white on black.
int FocusedRow(const Terminal& terminal) {
  constexpr int X = 13;
  constexpr int FIRST_ROW = 13;
  for (int row = 0; row < 3; ++row) {
    if (terminal.At(X, FIRST_ROW + row).bg == 0) return row;
  }
  return -1;
}

struct Move {
  std::string keys;
  int row;
};

TEST(LoginDialog, MovesItsFocusByTheKeys) {
  const std::string up = UP;
  const std::string down = DOWN;
  const std::pair<const char*, std::vector<Move>> terminals[] = {
      {"linux",
       {{"", 1},
        {"\t", 2},
        {"\t\t", 0},
        {"\t\t\t", 1},
        {"\r", 2},
        {up, 0},
        {up + up, 0},
        {up + "x", 0},
        {up + down, 1},
        {down + down, 2},
        {down + F3, 2}}},
      // Over a serial line there is no keyboard to configure.
      {"xterm-256color", {{"", 0}, {up, 0}, {"\t", 1}, {"\r", 1}, {"\t\t", 0}, {down + down, 1}}},
  };
  LoadScenario("static");
  for (const auto& [term, moves] : terminals) {
    Terminal terminal({.term = term});
    for (const auto& [keys, row] : moves) {
      OpenLogin(terminal);
      terminal.Type(keys);
      terminal.Settle();
      EXPECT_EQ(FocusedRow(terminal), row) << term << " " << keys << "\n" << terminal.Picture();
      terminal.Type(ESC);
    }
  }
}

struct Attempt {
  const char* scenario;
  const char* user;
  const char* password;
  bool denied;
};

TEST(Login, IsRefusedWithItsReason) {
  const std::string pam = ReadFile("/etc/pam.d/tarnel");
  const Attempt attempts[] = {
      {"static", "root", "wrong", false},        {"static", "nobody%s", "x", false},
      {"static", "locked", PASSWORD, false},     {"static", "expired", PASSWORD, false},
      {"login-denied", "root", "wrong", false},  {"login-denied", "root", PASSWORD, true},
      {"notary-absent", "root", "wrong", false},
  };
  const Log start;
  Terminal terminal;
  start.WaitFor({"user.info", "TARNEL: Starting TARNEL"});
  for (const auto& [scenario, user, password, denied] : attempts) {
    SCOPED_TRACE(std::string(scenario) + " " + user);
    LoadScenario(scenario);
    WriteFile("/var/log/notaryd.log", "");
    const Log log;
    LogIn(terminal, user, password);
    terminal.WaitFor(denied ? "User does not have permission to login to TARNEL."
                            : "Invalid login or password.");
    terminal.Type(ESC);  // Enter alone closes it
    terminal.Type(ENTER);
    terminal.WaitFor(EMPTY_FIELD);
    terminal.WaitFor(std::string("[ ") + user);
    terminal.Settle();
    EXPECT_EQ(FocusedRow(terminal), 2);
    EXPECT_TRUE(terminal.CursorVisible());
    terminal.Type(ESC);
    std::vector<LogLine> expected = {
        {"auth.err", denied
                         ? "TARNEL: Authorization of user root failed with permission denied error."
                         : std::string("TARNEL: Authentication of user ") + user +
                               " failed with authentication failure."},
        {"user.info", "TARNEL: Initializing notaryuser library"}};
    std::vector<std::string> events = {
        std::string("@&!*@*@(notary.user.tarnel.login.failed)Authentication for user ") + user +
        " failed"};
    if (std::string(scenario) == "notary-absent") {
      expected.push_back({"user.err",
                          "TARNEL: Unable to initialize notaryuser library from TARNEL. Error "
                          "code: 111"});
      events.clear();
    }
    std::vector<LogLine> lines = log.Lines();
    std::erase_if(lines, [](const LogLine& line) { return line.level.starts_with("authpriv"); });
    EXPECT_EQ(lines, expected) << LastLogLines(6);
    EXPECT_EQ(Events(), events);
    WriteFile("/etc/pam.d/tarnel", pam);
  }
}

TEST(Menu, OpensAfterALoginAndClosesWithALogOut) {
  LoadScenario("lockdown-impossible");
  Terminal terminal;
  const Log log;
  LogIn(terminal, "root", PASSWORD);
  terminal.WaitFor("System Customization");
  terminal.WaitFor(MENU);
  // The rows that are greyed are passed over.
  terminal.Type(DOWN);
  terminal.WaitFor("192.0.2.20");
  terminal.Settle();
  terminal.Type(ESC);
  terminal.WaitFor("<F2> Customize");
  log.WaitFor({"user.info", "TARNEL: User root logged out."});
  EXPECT_TRUE(log.Contains({"auth.emerg", "TARNEL: Authentication of user root succeeded"}));
  EXPECT_TRUE(log.Contains({"user.info", "TARNEL: User root logged in"}));
}

// Some memory that the process can write to holds the secret. Freed memory loses its first bytes,
// so only the secret's end is looked for.
bool Remembers(const Terminal& terminal, const std::string& secret) {
  const std::string end = secret.substr(secret.size() / 2);
  const std::string directory = "/proc/" + std::to_string(terminal.Pid());
  const Descriptor memory(open((directory + "/mem").c_str(), O_RDONLY | O_CLOEXEC));
  std::ifstream maps(directory + "/maps");
  std::string content;
  for (std::string line; std::getline(maps, line);) {
    uintmax_t start = 0;
    uintmax_t limit = 0;
    char access[5] = {};
    if (sscanf(line.c_str(), "%jx-%jx %4s", &start, &limit, access) != 3 || access[1] != 'w' ||
        limit - start > 1UL << 26) {
      continue;
    }
    content.resize(limit - start);
    const ssize_t count =
        pread(memory.Get(), content.data(), content.size(), static_cast<off_t>(start));
    if (memmem(content.data(), static_cast<size_t>(std::max<ssize_t>(count, 0)), end.data(),
               end.size()) != nullptr) {
      return true;
    }
  }
  return false;
}

// The last of the freed memory is kept from use, except for blocks that go back to the kernel.
const Launch SMALL_QUARANTINE = {
    .environment = {"ASAN_OPTIONS=quarantine_size_mb=1:thread_local_quarantine_size_kb=512"}};

TEST(Password, IsChangedForGoodAndForgotten) {
  const std::string secret = "the first of many passwords";
  LoadScenario("static");
  Terminal terminal(SMALL_QUARANTINE);
  LogIn(terminal, "empty", "");
  terminal.WaitFor("Change default password to prevent");
  terminal.Type(ENTER);
  terminal.WaitFor("Confirm Password:");
  terminal.Settle();
  terminal.Type("one\tother\r");
  terminal.WaitFor("The new password and the confirmed password do not match.");
  terminal.Type(ENTER);
  terminal.Settle();
  terminal.Type("\t\r");
  terminal.WaitFor("Empty passwords are not allowed.");
  terminal.Type(ENTER);
  terminal.Settle();
  terminal.Type(secret + "\t" + secret + ENTER);
  terminal.WaitFor(MENU);
  terminal.WaitFor(" Set ");
  EXPECT_EQ(
      Events().back(),
      "@&!*@*@(notary.user.tarnel.login.passwd.changed)Login password for user empty changed");
  EXPECT_FALSE(Remembers(terminal, secret));
  terminal.Type(ESC);
  LogIn(terminal, "empty", secret);
  terminal.WaitFor(MENU);
  EXPECT_FALSE(Remembers(terminal, secret));
}

// The card's user is logged out when the card goes, wherever the operator is.
TEST(SmartCard, IsTheWayInAndOut) {
  for (const char* keys : {"", "\r",
                           "\r"
                           "wrong\r"}) {
    LoadScenario("smart-card");
    const Log log;
    Terminal terminal;
    LogIn(terminal, "", PASSWORD);
    terminal.WaitFor(MENU);
    terminal.Type(keys);
    terminal.Settle();
    RunProgram({"/bin/lab", "card", "insert", "0", "other"});
    terminal.Settle();
    EXPECT_FALSE(terminal.HasEnded());
    RunProgram({"/bin/lab", "card", "pull", "1"});
    EXPECT_EQ(terminal.WaitForEnd(), 0) << keys;
    EXPECT_TRUE(log.Contains({"user.info", "TARNEL: Found smart card with user id 'root'"}));
    EXPECT_EQ(log.Lines().back(), (LogLine{"user.info", "TARNEL: Logging out user id 'root'"}));
  }
}

TEST(SmartCard, InAReaderThatFailsIsNone) {
  LoadScenario("card-reader-fails");
  const Log log;
  Terminal terminal;
  OpenLogin(terminal);
  terminal.WaitFor("Enter an authorized login name and password for");
  terminal.Type(F3);
  terminal.WaitFor("Login Id:          [  ");
  EXPECT_TRUE(log.Contains({"user.err", "TARNEL: Error trying to lookup smart card tokens."}));
}

TEST(Signals, AreHeededWhileAnOperatorIsLoggedIn) {
  LoadScenario("static");
  Terminal ended;
  LogIn(ended, "root", PASSWORD);
  ended.WaitFor(MENU);
  ended.Type(ENTER);
  ended.WaitFor("Confirm Password:");
  ended.Signal(SIGTERM);
  EXPECT_EQ(ended.WaitForEnd(), 0);
  EXPECT_TRUE(ended.ModesAreRestored());

  Terminal restarted;
  LogIn(restarted, "root", PASSWORD);
  restarted.WaitFor(MENU);
  restarted.Signal(SIGUSR2);
  restarted.Settle();
  EXPECT_FALSE(restarted.HasEnded());
  restarted.Type(ESC);
  EXPECT_EQ(restarted.WaitForEnd(), 0);
}

TEST(Password, ThatIsRefusedIsForgotten) {
  const std::string secret = "a secret that fits its field";
  LoadScenario("static");
  Terminal terminal(SMALL_QUARANTINE);
  LogIn(terminal, "root", secret);
  terminal.WaitFor("Invalid login or password.");
  // The field below the message still has it.
  EXPECT_TRUE(Remembers(terminal, secret));
  terminal.Type(ENTER);
  terminal.WaitFor(EMPTY_FIELD);
  EXPECT_FALSE(Remembers(terminal, secret));
  EXPECT_NE(ReadFile("/proc/" + std::to_string(terminal.Pid()) + "/limits")
                .find("Max core file size        1 "),
            std::string::npos);
}

}  // namespace

}  // namespace Tarnel::Testing
