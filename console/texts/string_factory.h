#pragma once

#include <string>

namespace Tarnel {

// The operator's texts, by their numbers.
class StringFactory {
 public:
  virtual ~StringFactory() = default;

  // Valid for the life of the process; empty for an id that is not in the catalogue.
  virtual const char* GetString(int id) = 0;

  // The catalogue of the process, made at the first call. Once it is there, the locale has no say;
  // before that, an unknown locale gives null.
  static StringFactory* ForLocale(const std::string& locale);
};

class en_US_Factory : public StringFactory {
 public:
  const char* GetString(int id) override;
};

}  // namespace Tarnel
