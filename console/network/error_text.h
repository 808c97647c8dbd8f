#pragma once

#include <string>

#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

// The part of an exception's text that the operator sees: between the first "=" and the last ";".
// Without a ";" it is empty, without a "=" it starts at the beginning; when the last ";" stands
// before the first "=", it runs to the end.
std::string ExtractErrorText(const Nodeplane::Lib::NodeplaneException& error);

}  // namespace Tarnel
