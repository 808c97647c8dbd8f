#include "console/hostops/pam.h"

#include <gtest/gtest.h>

#include "console/hostops/command_runner.h"
#include "tests/support/lab.h"

namespace Tarnel::Testing {
namespace {

constexpr int OFF = PAM_PROMPT_ECHO_OFF;
constexpr int ON = PAM_PROMPT_ECHO_ON;
constexpr int INFO = PAM_TEXT_INFO;
constexpr int ERR = PAM_ERROR_MSG;

// The answers, each with a blank behind it, "-" for an empty one. Frees them, as PAM does.
std::string TakeAnswers(pam_response* responses, size_t count) {
  std::string text;
  for (size_t i = 0; i < count; ++i) {
    text += std::string(responses[i].resp == nullptr ? "-" : responses[i].resp) + " ";
    free(responses[i].resp);
  }
  free(responses);
  return text;
}

TEST(ChangeConversation, AnswersOldNewNewThenNothing) {
  struct {
    // Styles of the messages, call by call.
    std::vector<std::vector<int>> calls;
    const char* answers;
  } const rows[] = {
      {{{OFF}, {OFF}, {OFF}, {OFF}}, "old new new - "},
      {{{OFF, OFF, OFF, OFF, OFF}}, "old new new - - "},
      {{{INFO, OFF}, {ERR}, {ON, OFF, INFO}, {OFF}}, "- old - - new - new "},
  };
  for (const auto& row : rows) {
    pamConvRespCount = 0;
    PasswordPair passwords{"old", "new"};
    std::string answers;
    for (const std::vector<int>& styles : row.calls) {
      std::vector<pam_message> messages;
      std::vector<const pam_message*> pointers;
      messages.reserve(styles.size());
      for (const int style : styles) {
        messages.push_back({style, "Prompt: "});
        pointers.push_back(&messages.back());
      }
      pam_response* responses = nullptr;
      ASSERT_EQ(PamChangeConversation(static_cast<int>(styles.size()), pointers.data(), &responses,
                                      &passwords),
                PAM_SUCCESS);
      answers += TakeAnswers(responses, styles.size());
    }
    EXPECT_EQ(answers, row.answers);
  }
}

TEST(OnePasswordConversation, AnswersOneMessageAndRefusesAnythingElse) {
  const pam_message prompt{OFF, "Password: "};
  const pam_message question{ON, "Name: "};
  const pam_message* prompts[] = {&prompt, &prompt};
  const pam_message* questions[] = {&question};
  char password[] = "secret";
  pam_response* responses = nullptr;
  EXPECT_EQ(PamOnePasswordConversation(0, prompts, &responses, password), PAM_CONV_ERR);
  EXPECT_EQ(PamOnePasswordConversation(2, prompts, &responses, password), PAM_CONV_ERR);
  EXPECT_EQ(PamOnePasswordConversation(1, prompts, &responses, nullptr), PAM_CONV_ERR);
  EXPECT_EQ(responses, nullptr);
  EXPECT_EQ(PamOnePasswordConversation(1, prompts, &responses, password), PAM_SUCCESS);
  EXPECT_EQ(TakeAnswers(responses, 1), "secret ");
  EXPECT_EQ(PamOnePasswordConversation(1, questions, &responses, password), PAM_SUCCESS);
  EXPECT_EQ(TakeAnswers(responses, 1), "- ");
}

// Adds accounts of every kind to the lab; all passwords are "first-secret".
class Accounts : public testing::Test {
 protected:
  void SetUp() override {
    const std::string hash =
        "$6$labsalt$GKEah4RK7sEbHfV7uimlaO1P5/KQ/b8Mgpa8XTi3uK4rdRMDPvbXI1gwG2F8GAzPjp3guqfAouXBv"
        "SVCmrfY40";
    std::string passwd = _passwd;
    for (const char* name : {"plain", "open", "lapsed"}) {
      passwd += std::string(name) + ":x:3000:3000::/:/bin/sh\n";
    }
    WriteFile("/etc/passwd", passwd);
    WriteFile("/etc/shadow", _shadow + "open::20000:0:99999:7:::\n" + "plain:" + hash +
                                 ":20000:0:99999:7:::\n" + "lapsed:" + hash +
                                 ":20000:0:99999:7::1:\n");
  }
  void TearDown() override {
    WriteFile("/etc/passwd", _passwd);
    WriteFile("/etc/shadow", _shadow);
    EXPECT_EQ(LastLogLines(1000).find("-secret"), std::string::npos) << "a password was logged";
  }

 private:
  const std::string _passwd = ReadFile("/etc/passwd");
  const std::string _shadow = ReadFile("/etc/shadow");
};

TEST_F(Accounts, AuthenticateGivesThePamCode) {
  EXPECT_EQ(PamAuthenticate("plain", "first-secret"), PAM_SUCCESS);
  EXPECT_EQ(PamAuthenticate("plain", "first-secret "), PAM_AUTH_ERR);
  EXPECT_EQ(PamAuthenticate("plain", ""), PAM_AUTH_ERR);
  EXPECT_EQ(PamAuthenticate("open", ""), PAM_SUCCESS);
  EXPECT_EQ(PamAuthenticate("lapsed", "first-secret"), PAM_ACCT_EXPIRED);
  EXPECT_NE(PamAuthenticate("nobody-of-that-name", "first-secret"), PAM_SUCCESS);
  EXPECT_NE(PamAuthenticate("", "first-secret"), PAM_SUCCESS);
}

TEST_F(Accounts, ChangePasswordIsSeenAtTheNextLogin) {
  EXPECT_TRUE(PamChangePassword("plain", "first-secret", "second-secret"));
  EXPECT_TRUE(PamChangePassword("plain", "second-secret", "third-secret"));
  EXPECT_EQ(PamAuthenticate("plain", "third-secret"), PAM_SUCCESS);
  EXPECT_EQ(PamAuthenticate("plain", "first-secret"), PAM_AUTH_ERR);
  EXPECT_TRUE(PamChangePassword("open", "", "new-secret"));
  EXPECT_EQ(PamAuthenticate("open", "new-secret"), PAM_SUCCESS);
}

TEST_F(Accounts, ARefusedChangeChangesNothing) {
  const std::string before = ReadFile("/etc/shadow");
  EXPECT_FALSE(PamChangePassword("plain", "wrong-secret", "second-secret"));
  for (const char* user : {"lapsed", "nobody-of-that-name"}) {
    EXPECT_FALSE(PamChangePassword(user, "first-secret", "second-secret")) << user;
  }
  EXPECT_EQ(ReadFile("/etc/shadow"), before);
}

}  // namespace
}  // namespace Tarnel::Testing
