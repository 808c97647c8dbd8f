#include "console/hostops/pam.h"

#include <malloc.h>

#include <cstdlib>
#include <cstring>
#include <memory>

#include "console/hostops/command_runner.h"
#include "console/screen/screen.h"

namespace Tarnel {
namespace {

void WipeAndFree(char* secret) {
  if (secret != nullptr) {
    explicit_bzero(secret, strlen(secret));
    free(secret);
  }
}

struct SecretDeleter {
  void operator()(char* secret) const { WipeAndFree(secret); }
};
using Secret = std::unique_ptr<char, SecretDeleter>;

// A copy for a module of PAM, which frees it and often does not wipe it before. A block of this
// size is given back to the kernel when it is freed, so nothing of it stays in the heap.
char* CopyForModule(const char* secret) {
  constexpr size_t BLOCK_OF_ITS_OWN = 1U << 20;
  mallopt(M_MMAP_THRESHOLD, BLOCK_OF_ITS_OWN);
  const size_t size = strlen(secret) + 1;
  auto* const copy = static_cast<char*>(malloc(BLOCK_OF_ITS_OWN + size));
  if (copy != nullptr) {
    memcpy(copy, secret, size);
  }
  return copy;
}

// The responses to one call, until PAM takes them.
class Responses {
 public:
  explicit Responses(int count)
      : _count(count),
        _responses(
            static_cast<pam_response*>(calloc(static_cast<size_t>(count), sizeof(pam_response)))) {}
  ~Responses() {
    for (int i = 0; _responses != nullptr && i < _count; ++i) {
      WipeAndFree(_responses[i].resp);
    }
    free(_responses);
  }
  Responses(const Responses&) = delete;
  Responses& operator=(const Responses&) = delete;

  bool Made() const { return _responses != nullptr; }
  // False when there is no memory for the copy.
  bool Answer(int index, const char* text) {
    _responses[index].resp = CopyForModule(text);
    return _responses[index].resp != nullptr;
  }
  pam_response* Release() {
    pam_response* released = _responses;
    _responses = nullptr;
    return released;
  }

 private:
  int _count;
  pam_response* _responses;
};

// One PAM transaction; it ends with the code of its last step.
class PamTransaction {
 public:
  PamTransaction(const std::string& user, const pam_conv& conversation)
      : _code(pam_start(TARNEL_APP, user.c_str(), &conversation, &_handle)) {}
  ~PamTransaction() {
    if (_handle != nullptr) {
      pam_end(_handle, _code);
    }
  }
  PamTransaction(const PamTransaction&) = delete;
  PamTransaction& operator=(const PamTransaction&) = delete;

  // Nothing happens once a step has failed.
  void Step(int (*operation)(pam_handle_t*, int), int flags) {
    if (_code == PAM_SUCCESS) {
      _code = operation(_handle, flags);
    }
  }
  int Code() const { return _code; }

 private:
  pam_handle_t* _handle = nullptr;
  int _code;
};

const char* NextPassword(const PasswordPair& passwords) {
  switch (pamConvRespCount) {
    case 0:
      return passwords.oldPassword;
    case 1:
    case 2:
      return passwords.newPassword;
    default:
      return nullptr;
  }
}

}  // namespace

int pamConvRespCount = 0;

int PamOnePasswordConversation(int count, const pam_message** messages, pam_response** responses,
                               void* data) {
  if (count != 1 || messages == nullptr || messages[0] == nullptr || responses == nullptr ||
      data == nullptr) {
    return PAM_CONV_ERR;
  }
  Responses made(1);
  if (!made.Made() || (messages[0]->msg_style == PAM_PROMPT_ECHO_OFF &&
                       !made.Answer(0, static_cast<const char*>(data)))) {
    return PAM_BUF_ERR;
  }
  *responses = made.Release();
  return PAM_SUCCESS;
}

int PamChangeConversation(int count, const pam_message** messages, pam_response** responses,
                          void* data) {
  if (count <= 0 || messages == nullptr || responses == nullptr || data == nullptr) {
    return PAM_CONV_ERR;
  }
  Responses made(count);
  if (!made.Made()) {
    return PAM_BUF_ERR;
  }
  for (int i = 0; i < count; ++i) {
    const char* password = NextPassword(*static_cast<const PasswordPair*>(data));
    if (messages[i]->msg_style != PAM_PROMPT_ECHO_OFF || password == nullptr) {
      continue;
    }
    if (!made.Answer(i, password)) {
      return PAM_BUF_ERR;
    }
    ++pamConvRespCount;
  }
  *responses = made.Release();
  return PAM_SUCCESS;
}

int PamAuthenticate(const std::string& user, const std::string& password) {
  UpdateScreen();
  const Secret copy(strdup(password.c_str()));
  if (copy == nullptr) {
    return PAM_BUF_ERR;
  }
  PamTransaction transaction(user, {PamOnePasswordConversation, copy.get()});
  transaction.Step(pam_authenticate, PAM_SILENT);
  transaction.Step(pam_acct_mgmt, PAM_SILENT);
  return transaction.Code();
}

bool PamChangePassword(const std::string& user, const std::string& oldPassword,
                       const std::string& newPassword) {
  UpdateScreen();
  pamConvRespCount = 0;
  PasswordPair passwords{oldPassword.c_str(), newPassword.c_str()};
  PamTransaction transaction(user, {PamChangeConversation, &passwords});
  transaction.Step(pam_authenticate, PAM_SILENT);
  transaction.Step(pam_acct_mgmt, PAM_SILENT);
  transaction.Step(pam_chauthtok, PAM_SILENT);
  transaction.Step(pam_setcred, PAM_REFRESH_CRED);
  return transaction.Code() == PAM_SUCCESS;
}

}  // namespace Tarnel
