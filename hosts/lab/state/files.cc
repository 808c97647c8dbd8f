#include "hosts/lab/state/files.h"

#include <sys/stat.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <string_view>

namespace Lab {

namespace {

[[noreturn]] void Fail(const std::string& path) { throw StateError(path + ": " + strerror(errno)); }

void WriteAll(const Descriptor& file, std::string_view rest, const std::string& path) {
  while (!rest.empty()) {
    const ssize_t count = write(file.Get(), rest.data(), rest.size());
    if (count < 0 && errno != EINTR) Fail(path);
    if (count > 0) rest.remove_prefix(static_cast<size_t>(count));
  }
}

}  // namespace

std::string ReadFile(const std::string& path) {
  const Descriptor file(path, O_RDONLY);
  if (file.Get() < 0) Fail(path);
  return ReadFile(file, path);
}

std::string ReadFile(const Descriptor& file, const std::string& path) {
  std::string content;
  char buffer[4096];
  for (;;) {
    const ssize_t count = read(file.Get(), buffer, sizeof buffer);
    if (count == 0) return content;
    if (count < 0 && errno != EINTR) Fail(path);
    if (count > 0) content.append(buffer, static_cast<size_t>(count));
  }
}

void ReplaceFile(const std::string& path, const std::string& content, mode_t mode) {
  const std::string fresh = path + ".new";
  const Descriptor file(fresh, O_WRONLY | O_CREAT | O_TRUNC, mode);
  if (file.Get() < 0) Fail(fresh);
  WriteAll(file, content, fresh);
  if (fchmod(file.Get(), mode) != 0 || rename(fresh.c_str(), path.c_str()) != 0) Fail(path);
}

Json ParseDocument(const std::string& text, const std::string& path) {
  try {
    return Json::parse(text);
  } catch (const Json::parse_error& error) {
    throw StateError(path + ": not JSON at byte " + std::to_string(error.byte));
  }
}

Json ReadDocument(const std::string& path) { return ParseDocument(ReadFile(path), path); }

}  // namespace Lab
