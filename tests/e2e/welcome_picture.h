#pragma once

#include <string>
#include <vector>

namespace Tarnel::Testing {

// The network lines of the made-up machine.
inline const std::vector<std::string> STATIC_NETWORK = {
    "Download tools to manage this host from:",
    "http://rack7/",
    "http://192.0.2.20/ (STATIC)",
};

// What the welcome screen of the made-up machine may differ in.
struct Welcome {
  std::vector<std::string> network = STATIC_NETWORK;
  std::string machine = "Halden Systems Rackline R240";
  std::string processor = "Halden Core 6214 CPU @ 2.40GHz";
  std::string memory = "16 GiB Memory";
  std::vector<std::string> warning = {};
  int columns = 80;
  int rows = 25;
};

// The whole picture, with its box and its two key hints.
std::string WelcomePicture(const Welcome& welcome = {});

}  // namespace Tarnel::Testing
