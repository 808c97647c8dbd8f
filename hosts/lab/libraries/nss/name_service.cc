// The lab's name service behind /etc/hosts: the C library loads it as libnss_lab.so.2 by
// /etc/nsswitch.conf. It answers from the state's table "names":
//   NAME: {answers[], delayMs}
// and knows no name without answers.

#include <arpa/inet.h>
#include <netdb.h>
#include <nss.h>

#include <cerrno>
#include <chrono>
#include <cstring>
#include <exception>
#include <optional>
#include <thread>
#include <vector>

#include "hosts/lab/state/host_state.h"

namespace {

struct Answer {
  int family;
  // In network order.
  unsigned char bytes[sizeof(in6_addr)];
};

size_t Length(int family) { return family == AF_INET6 ? sizeof(in6_addr) : sizeof(in_addr); }

std::optional<Answer> Parse(const std::string& text) {
  Answer answer{AF_INET, {}};
  if (inet_pton(AF_INET, text.c_str(), answer.bytes) == 1) return answer;
  answer.family = AF_INET6;
  if (inet_pton(AF_INET6, text.c_str(), answer.bytes) == 1) return answer;
  return std::nullopt;
}

// A name ends with or without a dot, and capitals do not matter.
bool IsSameName(std::string left, std::string right) {
  for (std::string* name : {&left, &right}) {
    if (name->ends_with('.')) name->pop_back();
  }
  return strcasecmp(left.c_str(), right.c_str()) == 0;
}

// Takes as long as the state says.
std::vector<Answer> Ask(const char* name, int family) {
  std::vector<Answer> answers;
  const auto state = Lab::ReadState();
  const Lab::Json names = state->value("names", Lab::Json::object());
  for (const auto& [known, entry] : names.items()) {
    if (!IsSameName(known, name)) continue;
    std::this_thread::sleep_for(std::chrono::milliseconds(Lab::Number(entry, "/delayMs", 0)));
    for (const Lab::Json& text : entry.value("answers", Lab::Json::array())) {
      const std::optional<Answer> answer = Parse(Lab::Text(text, ""));
      const bool wanted = answer && (family == AF_UNSPEC || family == answer->family);
      if (wanted) answers.push_back(*answer);
    }
  }
  return answers;
}

// Hands out pieces of the caller's buffer, null when it is too small.
class Buffer {
 public:
  Buffer(char* start, size_t size) : _next(start), _left(size) {}

  template <class T>
  T* Take(size_t count) {
    if (std::align(alignof(T), count * sizeof(T), _next, _left) == nullptr) return nullptr;
    T* const piece = static_cast<T*>(_next);
    memset(_next, 0, count * sizeof(T));
    _next = static_cast<char*>(_next) + count * sizeof(T);
    _left -= count * sizeof(T);
    return piece;
  }

  char* TakeText(const char* text) {
    const size_t size = strlen(text) + 1;
    char* const copy = Take<char>(size);
    if (copy != nullptr) memcpy(copy, text, size);
    return copy;
  }

 private:
  void* _next;
  size_t _left;
};

struct Errors {
  int* error;
  int* hostError;

  nss_status Fail(nss_status status, int code, int hostCode) const {
    *error = code;
    *hostError = hostCode;
    return status;
  }
  nss_status NotFound() const { return Fail(NSS_STATUS_NOTFOUND, ENOENT, HOST_NOT_FOUND); }
  nss_status TooSmall() const { return Fail(NSS_STATUS_TRYAGAIN, ERANGE, NETDB_INTERNAL); }
  nss_status Unavailable() const { return Fail(NSS_STATUS_UNAVAIL, EIO, NO_RECOVERY); }
};

nss_status FillHost(const char* name, int family, hostent& host, Buffer buffer,
                    const Errors& errors) {
  const std::vector<Answer> answers = Ask(name, family);
  if (answers.empty()) return errors.NotFound();
  char** const addresses = buffer.Take<char*>(answers.size() + 1);
  char** const aliases = buffer.Take<char*>(1);
  host = {buffer.TakeText(name), aliases, family, static_cast<int>(Length(family)), addresses};
  if (addresses == nullptr || aliases == nullptr || host.h_name == nullptr) {
    return errors.TooSmall();
  }
  for (size_t i = 0; i < answers.size(); ++i) {
    addresses[i] = buffer.Take<char>(Length(family));
    if (addresses[i] == nullptr) return errors.TooSmall();
    memcpy(addresses[i], answers[i].bytes, Length(family));
  }
  return NSS_STATUS_SUCCESS;
}

nss_status FillTuples(const char* name, gaih_addrtuple** tuples, Buffer buffer,
                      const Errors& errors) {
  const std::vector<Answer> answers = Ask(name, AF_UNSPEC);
  if (answers.empty()) return errors.NotFound();
  gaih_addrtuple* const made = buffer.Take<gaih_addrtuple>(answers.size());
  char* const copy = buffer.TakeText(name);
  if (made == nullptr || copy == nullptr) return errors.TooSmall();
  for (size_t i = 0; i < answers.size(); ++i) {
    made[i].next = i + 1 < answers.size() ? &made[i + 1] : nullptr;
    made[i].name = copy;
    made[i].family = answers[i].family;
    memcpy(made[i].addr, answers[i].bytes, Length(answers[i].family));
  }
  // The caller may bring the first one along.
  if (*tuples != nullptr) {
    **tuples = *made;
  } else {
    *tuples = made;
  }
  return NSS_STATUS_SUCCESS;
}

}  // namespace

// The names and the arguments are the C library's.
// NOLINTBEGIN(bugprone-reserved-identifier)
extern "C" {

nss_status _nss_lab_gethostbyname2_r(const char* name, int family, hostent* host, char* buffer,
                                     size_t size, int* error, int* hostError);
nss_status _nss_lab_gethostbyname_r(const char* name, hostent* host, char* buffer, size_t size,
                                    int* error, int* hostError);
nss_status _nss_lab_gethostbyname4_r(const char* name, gaih_addrtuple** tuples, char* buffer,
                                     size_t size, int* error, int* hostError, int32_t* ttl);

nss_status _nss_lab_gethostbyname2_r(const char* name, int family, hostent* host, char* buffer,
                                     size_t size, int* error, int* hostError) {
  const Errors errors{error, hostError};
  try {
    return FillHost(name, family, *host, Buffer(buffer, size), errors);
  } catch (const std::exception&) {
    return errors.Unavailable();
  }
}

nss_status _nss_lab_gethostbyname_r(const char* name, hostent* host, char* buffer, size_t size,
                                    int* error, int* hostError) {
  return _nss_lab_gethostbyname2_r(name, AF_INET, host, buffer, size, error, hostError);
}

nss_status _nss_lab_gethostbyname4_r(const char* name, gaih_addrtuple** tuples, char* buffer,
                                     size_t size, int* error, int* hostError, int32_t* ttl) {
  const Errors errors{error, hostError};
  if (ttl != nullptr) *ttl = 0;
  try {
    return FillTuples(name, tuples, Buffer(buffer, size), errors);
  } catch (const std::exception&) {
    return errors.Unavailable();
  }
}

}  // extern "C"
// NOLINTEND(bugprone-reserved-identifier)
