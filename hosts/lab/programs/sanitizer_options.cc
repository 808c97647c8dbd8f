// Standard error is /dev/null in the console and programs lose their environment, so the sanitizers
// write their reports where the tests look for them.

#if defined(__SANITIZE_ADDRESS__)
#include <dlfcn.h>
#endif

// The names are the sanitizers' own.
// NOLINTBEGIN(bugprone-reserved-identifier)
extern "C" {

const char* __asan_default_options();
const char* __ubsan_default_options();

const char* __asan_default_options() {
  return "log_path=/var/log/sanitizer:detect_leaks=1:abort_on_error=0:exitcode=99";
}

const char* __ubsan_default_options() {
  return "log_path=/var/log/sanitizer:print_stacktrace=1:exitcode=99";
}

}  // extern "C"
// NOLINTEND(bugprone-reserved-identifier)

#if defined(__SANITIZE_ADDRESS__)
namespace {

// Beside the other sanitizer, that of undefined behaviour sets the path in the other's library
// instead of its own.
[[gnu::constructor]] void SetReportPath() {
  void* const library = dlopen("libubsan.so.1", RTLD_LAZY | RTLD_NOLOAD);
  void* const set = library != nullptr ? dlsym(library, "__sanitizer_set_report_path") : nullptr;
  if (set != nullptr) {
    reinterpret_cast<void (*)(const char*)>(set)("/var/log/sanitizer");
  }
}

}  // namespace
#endif
