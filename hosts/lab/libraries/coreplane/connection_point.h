#pragma once

#include <memory>
#include <string>

#include "hostapi/nodeplane/virtual_switch.h"
#include "hosts/lab/libraries/perform.h"

namespace Lab {

// What each connection point of this host also is, so that an interface can be attached to it.
class Attachable {
 public:
  virtual ~Attachable() = default;
  // The node "connection" of an interface that is attached here.
  virtual Json Connection() const = 0;
};

// Where a kernel interface is attached by its node "connection", {type, ...}: port group of a
// standard switch, port of a distributed switch, or a point of which only the type is known.
std::unique_ptr<Nodeplane::Network::ConnectionPoint> MakeConnectionPoint(const Json& state,
                                                                         const std::string& nic);

// The node in words, such as "port group VM Network".
std::string DescribeConnection(const Json& connection);

// A point with the type that the management interface's one has, and of no further class.
template <>
std::unique_ptr<Nodeplane::Network::ConnectionPoint>
MakeOtherClass<Nodeplane::Network::ConnectionPoint>();

}  // namespace Lab
