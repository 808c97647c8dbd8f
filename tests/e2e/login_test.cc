// An operator logs in, works the menu and logs out.

#include <gtest/gtest.h>

#include <fstream>

#include "tests/support/lab.h"
#include "tests/support/terminal.h"

namespace Tarnel::Testing {

namespace {

constexpr char F3[] = "\x1b[13~";
constexpr char ENTER[] = "\r";

void OpenLogin(Terminal& terminal) {
  // A line that an earlier dialog has covered.
  terminal.WaitFor("Halden Core 6214 CPU");
  terminal.Type(Keys::F2);
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
  terminal.Type(F3);
  terminal.WaitFor("Login Name:        [ root ");
  EXPECT_TRUE(terminal.CursorVisible());
  terminal.Type(Keys::ESC);
  terminal.WaitFor("Halden Core 6214 CPU");
  terminal.Settle();
  EXPECT_FALSE(terminal.CursorVisible());
}

struct Attempt {
  const char* user;
  const char* password;
  const char* message;
  const char* logLine;
};

TEST(Login, IsRefusedWithItsReason) {
  LoadScenario("static");
  Terminal terminal;
  const Log log;
  const Attempt attempts[] = {
      {"root", "wrong", "Invalid login or password.",
       "Authentication of user root failed with authentication failure."},
      {"nobody%s", "x", "Invalid login or password.",
       "Authentication of user nobody%s failed with authentication failure."},
      {"locked", "laboratory", "Invalid login or password.",
       "Authentication of user locked failed with authentication failure."},
  };
  for (const Attempt& attempt : attempts) {
    SCOPED_TRACE(attempt.user);
    LogIn(terminal, attempt.user, attempt.password);
    terminal.WaitFor(attempt.message);
    terminal.Type(ENTER);
    terminal.WaitFor("[                                ]");
    terminal.Settle();
    terminal.Type(Keys::ESC);
    EXPECT_TRUE(log.Contains({"auth.err", std::string("TARNEL: ") + attempt.logLine}));
    EXPECT_EQ(Events().back(), "@&!*@*@(notary.user.tarnel.login.failed)Authentication for user " +
                                   std::string(attempt.user) + " failed");
  }
}

TEST(Menu, OpensAfterALoginAndClosesWithALogOut) {
  LoadScenario("lockdown-impossible");
  Terminal terminal;
  const Log log;
  LogIn(terminal, "root", "laboratory");
  terminal.WaitFor("System Customization");
  terminal.WaitFor("<Up/Down> Select");
  // The rows that are greyed are passed over.
  terminal.Type("\x1b[B");
  terminal.WaitFor("192.0.2.20");
  terminal.Settle();
  terminal.Type(Keys::ESC);
  terminal.WaitFor("<F2> Customize");
  log.WaitFor({"user.info", "TARNEL: User root logged out."});
  EXPECT_TRUE(log.Contains({"auth.emerg", "TARNEL: Authentication of user root succeeded"}));
  EXPECT_TRUE(log.Contains({"user.info", "TARNEL: User root logged in"}));
}

TEST(Password, IsChangedForGood) {
  LoadScenario("static");
  Terminal terminal;
  LogIn(terminal, "empty", "");
  terminal.WaitFor("Change default password to prevent");
  terminal.Type(ENTER);
  terminal.WaitFor("Confirm Password:");
  terminal.Settle();
  terminal.Type("first one\tother\r");
  terminal.WaitFor("The new password and the confirmed password do not match.");
  terminal.Type(ENTER);
  terminal.Settle();
  terminal.Type("first one\tfirst one\r");
  terminal.WaitFor("<Up/Down> Select");
  terminal.WaitFor(" Set ");
  EXPECT_EQ(
      Events().back(),
      "@&!*@*@(notary.user.tarnel.login.passwd.changed)Login password for user empty changed");
}

}  // namespace

}  // namespace Tarnel::Testing
