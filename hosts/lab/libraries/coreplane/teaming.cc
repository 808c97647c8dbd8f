#include "hosts/lab/libraries/coreplane/teaming.h"

namespace Lab {

using Nodeplane::Network::LinkCriteriaSelectionPolicy;
using Nodeplane::Network::NicTeamingPolicy;

namespace {

LinkCriteriaSelectionPolicy ReadLinkCriteria(const Json& node) {
  return {Flag(node, "/beacon", false), Flag(node, "/duplex", false), Flag(node, "/speed", false),
          static_cast<int32_t>(Number(node, "/megabits", 0))};
}

Json LinkCriteriaNode(const LinkCriteriaSelectionPolicy& criteria) {
  return {{"beacon", criteria.checkBeacon},
          {"duplex", criteria.checkDuplex},
          {"speed", criteria.checkSpeed},
          {"megabits", criteria.speedMegabits}};
}

}  // namespace

NicTeamingPolicy ReadTeaming(const Json& node) {
  NicTeamingPolicy policy;
  policy.SetUplinkOrder(Texts(node.value("order", Json::array())));
  policy.SetMaxActiveUplinks(static_cast<int>(Number(node, "/max", 0)));
  policy.SetLinkCriteria(ReadLinkCriteria(node.value("linkCriteria", Json::object())));
  // Last: the setters before have set bits of it.
  policy.SetFieldMask(static_cast<uint32_t>(Number(node, "/mask", 0)));
  return policy;
}

Json TeamingNode(const NicTeamingPolicy& policy) {
  return {{"mask", policy.GetFieldMask()},
          {"order", policy.GetUplinkOrder()},
          {"max", policy.GetMaxActiveUplinks()},
          {"linkCriteria", LinkCriteriaNode(policy.GetLinkCriteria())}};
}

std::string DescribeTeaming(const NicTeamingPolicy& policy) {
  std::string text = "mask " + std::to_string(policy.GetFieldMask()) + " order";
  for (const std::string& adapter : policy.GetUplinkOrder()) text += " " + adapter;
  return text + " max " + std::to_string(policy.GetMaxActiveUplinks());
}

std::vector<std::string> Texts(const Json& list) {
  std::vector<std::string> texts;
  for (const Json& text : list) texts.push_back(Text(text, ""));
  return texts;
}

}  // namespace Lab
