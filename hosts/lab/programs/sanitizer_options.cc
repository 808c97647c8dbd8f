// Standard error is /dev/null in the console and programs lose their environment, so the sanitizers
// write their reports where the tests look for them.

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
