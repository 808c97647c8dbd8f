#include "hosts/lab/libraries/coreplane/connection_point.h"

#include <utility>

#include "hosts/lab/libraries/coreplane/lattice.h"
#include "hosts/lab/libraries/coreplane/virtual_switch.h"

namespace {

using Lab::Json;
using Nodeplane::Network::ConnectionPoint;
using Nodeplane::Network::Portset;

class NoPortset : public Portset {
 public:
  std::vector<std::string> GetUplinks() const override { return {}; }
};

// No connection, an opaque network, or something that is not known here.
class PlainPoint : public ConnectionPoint, public Lab::Attachable {
 public:
  PlainPoint(std::string nic, int type) : _nic(std::move(nic)), _type(type) {}

  int GetConnecteeType() const override {
    return Lab::PerformRead<int>({"ConnectionPoint::GetConnecteeType", _nic},
                                 [this](const Json&) { return _type; });
  }

  std::unique_ptr<Portset> GetPortset() const override {
    return Lab::PerformRead<std::unique_ptr<Portset>>(
        {"ConnectionPoint::GetPortset", _nic},
        [](const Json&) { return std::make_unique<NoPortset>(); });
  }

  Json Connection() const override { return {{"type", _type}}; }

 private:
  std::string _nic;
  int _type;
};

const Json& ConnectionNode(const Json& state, const std::string& nic) {
  static const Json none = {{"type", ConnectionPoint::CONNECTEE_NONE}};
  const Json& node = Lab::Object(state, ("/network/kernelNics/" + nic).c_str());
  return node.contains("connection") ? Lab::Object(node, "/connection") : none;
}

int TypeOf(const Json& connection) { return static_cast<int>(Lab::Number(connection, "/type")); }

}  // namespace

namespace Lab {

std::unique_ptr<ConnectionPoint> MakeConnectionPoint(const Json& state, const std::string& nic) {
  const Json& connection = ConnectionNode(state, nic);
  switch (const int type = TypeOf(connection)) {
    case ConnectionPoint::CONNECTEE_PORT_GROUP:
      return MakePortGroup(Text(connection, "/portGroup"));
    case ConnectionPoint::CONNECTEE_LATTICE_PORT:
      return MakeLatticePort(Text(connection, "/lattice"), Text(connection, "/port"));
    default:
      return std::make_unique<PlainPoint>(nic, type);
  }
}

std::string DescribeConnection(const Json& connection) {
  if (connection.contains("portGroup")) return "port group " + Text(connection, "/portGroup");
  if (connection.contains("port")) return "lattice port " + Text(connection, "/port");
  return "nothing";
}

template <>
std::unique_ptr<ConnectionPoint> MakeOtherClass<ConnectionPoint>() {
  const auto state = ReadState();
  const std::string nic = Text(*state, "/network/management");
  return std::make_unique<PlainPoint>(nic, TypeOf(ConnectionNode(*state, nic)));
}

}  // namespace Lab
