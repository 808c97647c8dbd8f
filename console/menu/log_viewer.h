#pragma once

#include <string>

namespace Tarnel {

// The logs that exist at this moment, each with its number.
std::string LogListText();
// The path of the log with this number in the list last made; null when there is none.
const char* FindLog(int number);

// Hands the terminal to the pager until the operator quits it. The caller draws its screen anew
// afterwards.
void RunPager(const char* path);

}  // namespace Tarnel
