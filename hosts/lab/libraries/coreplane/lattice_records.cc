#include "hosts/lab/libraries/coreplane/lattice_records.h"

#include <algorithm>

namespace Lab {

using Nodeplane::Network::LatticeFilter;
using Nodeplane::Network::LatticeSecurity;
using Nodeplane::Network::LatticeShaping;
using Nodeplane::Network::LatticeTeaming;
using Nodeplane::Network::LatticeVlan;
using Nodeplane::Network::VlanRange;

namespace {

template <class T>
void Take(const Json& node, const char* name, T& value) {
  if (node.contains(name)) node.at(name).get_to(value);
}

}  // namespace

Json ToNode(const LatticeVlan& vlan) {
  Json ranges = Json::array();
  for (const VlanRange& range : vlan.ranges) {
    ranges.push_back({{"first", range.first}, {"last", range.last}});
  }
  return {{"flags", vlan.flags}, {"id", vlan.vlanId}, {"ranges", ranges}};
}

void FromNode(const Json& node, LatticeVlan& vlan) {
  Take(node, "flags", vlan.flags);
  Take(node, "id", vlan.vlanId);
  vlan.ranges.clear();
  for (const Json& range : node.value("ranges", Json::array())) {
    vlan.ranges.push_back({range.at("first"), range.at("last")});
  }
}

Json ToNode(const LatticeTeaming& teaming) {
  return {{"kind", teaming.policyKind},      {"flags", teaming.flags},
          {"number", teaming.number},        {"moreFlags", teaming.moreFlags},
          {"active", teaming.activeUplinks}, {"standby", teaming.standbyUplinks}};
}

void FromNode(const Json& node, LatticeTeaming& teaming) {
  Take(node, "kind", teaming.policyKind);
  Take(node, "flags", teaming.flags);
  Take(node, "number", teaming.number);
  Take(node, "moreFlags", teaming.moreFlags);
  Take(node, "active", teaming.activeUplinks);
  Take(node, "standby", teaming.standbyUplinks);
}

Json ToNode(const LatticeSecurity& security) {
  return {{"promiscuous", security.promiscuous},
          {"macChanges", security.macChanges},
          {"forgedTransmits", security.forgedTransmits}};
}

void FromNode(const Json& node, LatticeSecurity& security) {
  Take(node, "promiscuous", security.promiscuous);
  Take(node, "macChanges", security.macChanges);
  Take(node, "forgedTransmits", security.forgedTransmits);
}

Json ToNode(const LatticeShaping& shaping) {
  return {{"enabled", shaping.enabled},
          {"average", shaping.averageBandwidth},
          {"peak", shaping.peakBandwidth},
          {"burst", shaping.burstSize}};
}

void FromNode(const Json& node, LatticeShaping& shaping) {
  Take(node, "enabled", shaping.enabled);
  Take(node, "average", shaping.averageBandwidth);
  Take(node, "peak", shaping.peakBandwidth);
  Take(node, "burst", shaping.burstSize);
}

Json ToNode(const std::vector<LatticeFilter>& filters) {
  Json nodes = Json::array();
  for (const LatticeFilter& filter : filters) {
    nodes.push_back({{"name", filter.name}, {"parameters", filter.parameters}});
  }
  return nodes;
}

void FromNode(const Json& node, std::vector<LatticeFilter>& filters) {
  for (const Json& filter : node) {
    filters.push_back({filter.at("name"), filter.value("parameters", std::vector<std::string>())});
  }
}

std::string DescribeNode(const Json& node) {
  if (node.is_string()) return node.get<std::string>();
  std::string text = node.dump();
  text.erase(std::remove(text.begin(), text.end(), '"'), text.end());
  return text;
}

}  // namespace Lab
