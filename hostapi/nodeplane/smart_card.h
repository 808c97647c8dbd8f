#pragma once

#include <string>
#include <vector>

namespace Nodeplane::Hardware {

// One slot of a card reader. The console only hands it back to the host.
struct SmartCardSlot {
  int number = 0;
};

// What a card says of itself and of its holder.
struct SmartCardToken {
  std::string label;
  std::string manufacturer;
  std::string model;
  std::string serialNumber;
  std::string firmwareVersion;
  std::string readerName;
  // Subjects of the certificates on the card.
  std::vector<std::string> subjects;
  // The users that the card stands for; an entry may be empty.
  std::vector<std::string> userIds;
};

}  // namespace Nodeplane::Hardware
