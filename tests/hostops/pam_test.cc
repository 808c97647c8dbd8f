#include "hostops/pam.h"

#include <gtest/gtest.h>

#include "hostops/command_runner.h"
#include "tests/support/lab.h"

namespace Tarnel::Testing {
namespace {

// Frees the responses of a conversation, as PAM does.
class Replies {
 public:
  explicit Replies(int count) : _count(count) {}
  ~Replies() {
    for (int i = 0; responses != nullptr && i < _count; ++i) {
      free(responses[i].resp);
    }
    free(responses);
  }
  Replies(const Replies&) = delete;
  Replies& operator=(const Replies&) = delete;

  // The answers, each with a blank behind it; "-" for an empty one.
  std::string Text() const {
    std::string text;
    for (int i = 0; i < _count; ++i) {
      text += std::string(responses[i].resp == nullptr ? "-" : responses[i].resp) + " ";
    }
    return text;
  }

  pam_response* responses = nullptr;

 private:
  int _count;
};

struct PromptCase {
  const char* name;
  // Styles of the messages, call by call.
  std::vector<std::vector<int>> calls;
  const char* answers;
};

class ChangeConversationTable : public testing::TestWithParam<PromptCase> {};

TEST_P(ChangeConversationTable, AnswersOldNewNewThenNothing) {
  pamConvRespCount = 0;
  PasswordPair passwords{"old", "new"};
  std::string answers;
  for (const std::vector<int>& styles : GetParam().calls) {
    std::vector<pam_message> messages(styles.size());
    std::vector<const pam_message*> pointers(styles.size());
    for (size_t i = 0; i < styles.size(); ++i) {
      messages[i] = {styles[i], "Password: "};
      pointers[i] = &messages[i];
    }
    const int count = static_cast<int>(styles.size());
    Replies replies(count);
    ASSERT_EQ(PamChangeConversation(count, pointers.data(), &replies.responses, &passwords),
              PAM_SUCCESS);
    answers += replies.Text();
  }
  EXPECT_EQ(answers, GetParam().answers);
}

constexpr int OFF = PAM_PROMPT_ECHO_OFF;
constexpr int ON = PAM_PROMPT_ECHO_ON;
constexpr int INFO = PAM_TEXT_INFO;
constexpr int ERR = PAM_ERROR_MSG;

INSTANTIATE_TEST_SUITE_P(
    All, ChangeConversationTable,
    testing::Values(PromptCase{"one_per_call", {{OFF}, {OFF}, {OFF}, {OFF}}, "old new new - "},
                    PromptCase{"all_in_one", {{OFF, OFF, OFF, OFF, OFF}}, "old new new - - "},
                    PromptCase{"one_then_two", {{OFF}, {OFF, OFF}}, "old new new "},
                    PromptCase{"others_between",
                               {{INFO, OFF}, {ERR}, {ON, OFF, INFO}, {OFF}},
                               "- old - - new - new "}),
    [](const auto& row) { return std::string(row.param.name); });

TEST(OnePasswordConversation, AnswersOneMessage) {
  const pam_message messages[] = {{OFF, "Password: "}, {ON, "Name: "}, {INFO, "Hello"}};
  const char* const answers[] = {"secret ", "- ", "- "};
  char password[] = "secret";
  for (size_t i = 0; i < std::size(messages); ++i) {
    const pam_message* message = &messages[i];
    Replies replies(1);
    EXPECT_EQ(PamOnePasswordConversation(1, &message, &replies.responses, password), PAM_SUCCESS);
    EXPECT_EQ(replies.Text(), answers[i]);
  }
}

TEST(OnePasswordConversation, RefusesAnythingElse) {
  const pam_message message{OFF, "Password: "};
  const pam_message* messages[] = {&message, &message};
  const pam_message* missing[] = {nullptr};
  pam_response* responses = nullptr;
  char password[] = "secret";
  EXPECT_EQ(PamOnePasswordConversation(0, messages, &responses, password), PAM_CONV_ERR);
  EXPECT_EQ(PamOnePasswordConversation(2, messages, &responses, password), PAM_CONV_ERR);
  EXPECT_EQ(PamOnePasswordConversation(1, nullptr, &responses, password), PAM_CONV_ERR);
  EXPECT_EQ(PamOnePasswordConversation(1, missing, &responses, password), PAM_CONV_ERR);
  EXPECT_EQ(PamOnePasswordConversation(1, messages, nullptr, password), PAM_CONV_ERR);
  EXPECT_EQ(PamOnePasswordConversation(1, messages, &responses, nullptr), PAM_CONV_ERR);
  EXPECT_EQ(responses, nullptr);
}

// Adds accounts of every kind to the lab; all passwords are "first-secret".
class Accounts : public testing::Test {
 protected:
  static constexpr char HASH[] =
      "$6$labsalt$GKEah4RK7sEbHfV7uimlaO1P5/KQ/b8Mgpa8XTi3uK4rdRMDPvbXI1gwG2F8GAzPjp3guqfAouXBvSVC"
      "mrfY40";

  void SetUp() override {
    _passwd = ReadFile("/etc/passwd");
    _shadow = ReadFile("/etc/shadow");
    const std::string hash = HASH;
    std::string passwd = _passwd;
    std::string shadow = _shadow;
    const std::pair<const char*, std::string> accounts[] = {
        {"plain", hash + ":20000:0:99999:7:::"},
        {"open", ":20000:0:99999:7:::"},
        {"barred", "!" + hash + ":20000:0:99999:7:::"},
        {"lapsed", hash + ":20000:0:99999:7::1:"},
        {"aged", hash + ":0:0:99999:7:::"},
    };
    int uid = 3000;
    for (const auto& [name, rest] : accounts) {
      const std::string id = std::to_string(++uid);
      passwd.append(name).append(":x:").append(id).append(":").append(id).append("::/:/bin/sh\n");
      shadow.append(name).append(":" + rest + "\n");
    }
    WriteFile("/etc/passwd", passwd);
    WriteFile("/etc/shadow", shadow);
  }
  void TearDown() override {
    WriteFile("/etc/passwd", _passwd);
    WriteFile("/etc/shadow", _shadow);
  }

 private:
  std::string _passwd;
  std::string _shadow;
};

TEST_F(Accounts, AuthenticateGivesThePamCode) {
  struct {
    const char* user;
    const char* password;
    int code;
  } const rows[] = {
      {"plain", "first-secret", PAM_SUCCESS},
      {"plain", "First-secret", PAM_AUTH_ERR},
      {"plain", "first-secret ", PAM_AUTH_ERR},
      {"plain", "", PAM_AUTH_ERR},
      {"open", "", PAM_SUCCESS},
      {"barred", "first-secret", PAM_AUTH_ERR},
      {"lapsed", "first-secret", PAM_ACCT_EXPIRED},
      {"aged", "first-secret", PAM_NEW_AUTHTOK_REQD},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(PamAuthenticate(row.user, row.password), row.code) << row.user << " " << row.password;
  }
  for (const char* unknown : {"nobody-of-that-name", "", "%s%n", "../root"}) {
    EXPECT_NE(PamAuthenticate(unknown, "first-secret"), PAM_SUCCESS) << unknown;
  }
}

TEST_F(Accounts, ChangePasswordIsSeenAtTheNextLogin) {
  EXPECT_TRUE(PamChangePassword("plain", "first-secret", "second-secret"));
  EXPECT_EQ(PamAuthenticate("plain", "second-secret"), PAM_SUCCESS);
  EXPECT_EQ(PamAuthenticate("plain", "first-secret"), PAM_AUTH_ERR);
  EXPECT_TRUE(PamChangePassword("plain", "second-secret", "third-secret"));
  EXPECT_EQ(PamAuthenticate("plain", "third-secret"), PAM_SUCCESS);

  EXPECT_TRUE(PamChangePassword("open", "", "new-secret"));
  EXPECT_EQ(PamAuthenticate("open", "new-secret"), PAM_SUCCESS);
  EXPECT_EQ(PamAuthenticate("open", ""), PAM_AUTH_ERR);
}

TEST_F(Accounts, ARefusedChangeChangesNothing) {
  const std::string before = ReadFile("/etc/shadow");
  EXPECT_FALSE(PamChangePassword("plain", "wrong-secret", "second-secret"));
  EXPECT_FALSE(PamChangePassword("barred", "first-secret", "second-secret"));
  EXPECT_FALSE(PamChangePassword("lapsed", "first-secret", "second-secret"));
  EXPECT_FALSE(PamChangePassword("nobody-of-that-name", "first-secret", "second-secret"));
  EXPECT_EQ(ReadFile("/etc/shadow"), before);
}

TEST_F(Accounts, PasswordsStayOutOfTheLog) {
  PamAuthenticate("plain", "unspeakable-1");
  PamAuthenticate("nobody-of-that-name", "unspeakable-2");
  PamChangePassword("plain", "first-secret", "unspeakable-3");
  PamChangePassword("plain", "unspeakable-4", "unspeakable-5");
  EXPECT_EQ(LastLogLines(1000).find("unspeakable"), std::string::npos);
}

}  // namespace
}  // namespace Tarnel::Testing
