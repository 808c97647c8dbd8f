#include "console/texts/string_factory.h"

namespace Tarnel {

StringFactory* StringFactory::ForLocale(const std::string& locale) {
  static StringFactory* instance = nullptr;
  if (instance == nullptr && locale == "en_US") instance = new en_US_Factory;
  return instance;
}

}  // namespace Tarnel
