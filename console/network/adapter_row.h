#pragma once

#include <string>

namespace Tarnel {

// Whether adapter a comes before adapter b: by number when both are "upnic" and a number, whatever
// follows it, else by bytes.
bool ComparePnicNames(const std::string& a, const std::string& b);

// One line of the list of adapters in marked-up columns; what does not fit is cut down.
std::string FormatAdapterRow(const std::string& name, const std::string& label,
                             const std::string& mac, const std::string& status,
                             const std::string& usedBy);

}  // namespace Tarnel
