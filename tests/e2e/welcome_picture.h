#pragma once

#include <string>
#include <vector>

namespace Tarnel::Testing {

// What the welcome screen of the made-up machine differs in.
struct Welcome {
  std::vector<std::string> network;
  std::string machine = "Halden Systems Rackline R240";
  std::string processor = "Halden Core 6214 CPU @ 2.40GHz";
  std::string memory = "16 GiB Memory";
  std::vector<std::string> warning = {};
  int columns = 80;
  int rows = 25;
};

// The whole picture, with its box and its two key hints.
std::string WelcomePicture(const Welcome& welcome);

// The network lines of the made-up machine.
extern const std::vector<std::string> STATIC_NETWORK;

}  // namespace Tarnel::Testing
