#pragma once

#include <map>
#include <string>
#include <vector>

#include "hostapi/nodeplane/lattice.h"
#include "hosts/lab/state/host_state.h"

// The settings of a port of a distributed switch as nodes of the state. What a node lacks has the
// value of a fresh record.
namespace Lab {

Json ToNode(const Nodeplane::Network::LatticeVlan& vlan);
Json ToNode(const Nodeplane::Network::LatticeTeaming& teaming);
Json ToNode(const Nodeplane::Network::LatticeSecurity& security);
Json ToNode(const Nodeplane::Network::LatticeShaping& shaping);
Json ToNode(const std::vector<Nodeplane::Network::LatticeFilter>& filters);
// Flags, numbers, texts and containers of texts.
template <class T>
Json ToNode(const T& value) {
  return value;
}

void FromNode(const Json& node, Nodeplane::Network::LatticeVlan& vlan);
void FromNode(const Json& node, Nodeplane::Network::LatticeTeaming& teaming);
void FromNode(const Json& node, Nodeplane::Network::LatticeSecurity& security);
void FromNode(const Json& node, Nodeplane::Network::LatticeShaping& shaping);
void FromNode(const Json& node, std::vector<Nodeplane::Network::LatticeFilter>& filters);
template <class T>
void FromNode(const Json& node, T& value) {
  node.get_to(value);
}

// The node as one readable text for the trace: a plain text as it is, else such as
// {id:100,ranges:[]}.
std::string DescribeNode(const Json& node);

}  // namespace Lab
