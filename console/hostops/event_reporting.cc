#include "console/hostops/event_reporting.h"

#include <syslog.h>

#include "hostapi/notary_user.h"

namespace Tarnel {

int32_t OpenNotary() {
  syslog(LOG_INFO, "%s", "Initializing notaryuser library");
  const int32_t error = NotaryUserLib_Init();
  if (error != 0) {
    syslog(LOG_ERR, "Unable to initialize notaryuser library from TARNEL. Error code: %d", error);
  }
  return error;
}

void PostEvent(const char* message, const char* argument) {
  if (OpenNotary() != 0) {
    return;
  }
  NotaryUserLib_AddEvent(message, argument);
  NotaryUserLib_Close();
}

}  // namespace Tarnel
