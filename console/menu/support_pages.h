#pragma once

#include <string>
#include <vector>

namespace Tarnel {

// The pages of the integrator's support file; none when there is no such file.
std::vector<std::string> LoadSupportPages();

// One page with its number and the keys that leaf on; page counts from 0.
std::string SupportPageText(const std::vector<std::string>& pages, size_t page);

}  // namespace Tarnel
