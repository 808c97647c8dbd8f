// The client of the observation daemon. The lab's daemon is a file with one line for each event.

#include "hostapi/notary_user.h"

#include <cstdarg>
#include <cstdio>
#include <fstream>
#include <string>

#include "hosts/lab/libraries/perform.h"

namespace {

constexpr char EVENT_FILE[] = "/var/log/notaryd.log";
constexpr int32_t NOT_CONNECTED = -1;

bool connected = false;

// The state names the error of a daemon that is absent.
int32_t InitError() {
  try {
    return static_cast<int32_t>(Lab::Number(*Lab::ReadState(), "/notary/init", 0));
  } catch (const Lab::StateError&) {
    return NOT_CONNECTED;
  }
}

std::string Format(const char* format, va_list arguments) {
  char* text = nullptr;
  if (vasprintf(&text, format, arguments) < 0) return "";
  std::string message = text;
  free(text);
  return message;
}

}  // namespace

int32_t NotaryUserLib_Init() {
  const int32_t error = InitError();
  connected = error == 0;
  return error;
}

int32_t NotaryUserLib_AddEvent(const char* format, ...) {
  if (!connected) return NOT_CONNECTED;
  va_list arguments;
  va_start(arguments, format);
  std::string message = Format(format, arguments);
  va_end(arguments);
  Lab::TraceChange({"NotaryUserLib_AddEvent", "", {message}});
  for (char& character : message) {
    if (character == '\n') character = ' ';
  }
  std::ofstream(EVENT_FILE, std::ios::app) << message << '\n';
  return 0;
}

int32_t NotaryUserLib_Close() {
  connected = false;
  return 0;
}
