#pragma once

#include <security/pam_appl.h>

// How the console answers what PAM asks. The responses belong to PAM.

namespace Tarnel {

// Data of PamChangeConversation.
struct PasswordPair {
  const char* oldPassword;
  const char* newPassword;
};

// Password prompts that PamChangeConversation has answered in the change under way.
extern int pamConvRespCount;

// Answers exactly one message; data is the password as text. PAM_CONV_ERR for anything else.
int PamOnePasswordConversation(int count, const pam_message** messages, pam_response** responses,
                               void* data);

// Answers any number of messages, in one call or in several: the first password prompt with the
// old password, the next two with the new one, everything else with nothing.
int PamChangeConversation(int count, const pam_message** messages, pam_response** responses,
                          void* data);

}  // namespace Tarnel
