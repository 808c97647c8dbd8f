#include "console/network/error_text.h"

namespace Tarnel {

std::string ExtractErrorText(const Nodeplane::Lib::NodeplaneException& error) {
  const std::string text = error.what();
  const size_t end = text.rfind(';');
  if (end == std::string::npos) {
    return "";
  }
  const size_t equals = text.find('=');
  const size_t start = equals == std::string::npos ? 0 : equals + 1;
  return end < start ? text.substr(start) : text.substr(start, end - start);
}

}  // namespace Tarnel
