#pragma once

#include <cstdio>
#include <cstdlib>
#include <random>
#include <string>
#include <vector>

// Made-up input: the same in every run.
class Random {
 public:
  size_t Below(size_t limit) { return _engine() % limit; }
  const std::string& From(const std::vector<std::string>& texts) {
    return texts[Below(texts.size())];
  }

 private:
  std::mt19937 _engine{20};
};

// Ends the program unless the rule holds; prints the bytes of the text that breaks it.
inline void Require(bool holds, const char* rule, const std::string& text) {
  if (holds) return;
  fprintf(stderr, "broken: %s\n", rule);
  for (const char c : text) fprintf(stderr, c >= ' ' && c <= '~' ? "%c" : "\\x%02x", c & 0xff);
  fputc('\n', stderr);
  exit(EXIT_FAILURE);
}
