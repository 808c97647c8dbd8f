#include <algorithm>
#include <cerrno>
#include <cstring>
#include <string>

#include "hostapi/kernel.h"
#include "hosts/lab/libraries/perform.h"

namespace {

using Nodeplane::Lib::NodeplaneException;

// The text as far as it fits, with a NUL behind it.
template <size_t SIZE>
void CopyText(char (&target)[SIZE], const std::string& text) {
  const size_t length = std::min(text.size(), SIZE - 1);
  memcpy(target, text.data(), length);
  target[length] = '\0';
}

SystemVersionRecord VersionRecord(const Lab::Json& state) {
  SystemVersionRecord record{};
  CopyText(record.productName, Lab::Text(state, "/host/version/product"));
  CopyText(record.version, Lab::Text(state, "/host/version/version"));
  CopyText(record.releaseType, Lab::Text(state, "/host/version/releaseType"));
  CopyText(record.buildText, Lab::Text(state, "/host/version/buildText"));
  record.buildNumber = static_cast<uint32_t>(Lab::Number(state, "/host/version/buildNumber"));
  return record;
}

SystemBootOptionRecord BootOptionRecord(const Lab::Json& state) {
  SystemBootOptionRecord record{};
  record.auditMode = Lab::Flag(state, "/host/auditMode") ? 1 : 0;
  return record;
}

template <class Record>
void Fill(void* buffer, size_t size, const Record& record) {
  if (size != sizeof record) throw NodeplaneException("wrong size of a sysinfo node");
  memcpy(buffer, &record, size);
}

const char* NameOf(SysinfoNode node) {
  switch (node) {
    case SYSNODE_NODE_system_version:
      return "system_version";
    case SYSNODE_NODE_system_bootOption:
      return "system_bootOption";
  }
  return "unknown";
}

void FillNode(const Lab::Json& state, SysinfoNode node, void* buffer, size_t size) {
  switch (node) {
    case SYSNODE_NODE_system_version:
      return Fill(buffer, size, VersionRecord(state));
    case SYSNODE_NODE_system_bootOption:
      return Fill(buffer, size, BootOptionRecord(state));
  }
  throw NodeplaneException("no such sysinfo node");
}

}  // namespace

int Sysnode_Get(SysinfoNode node, void* buffer, size_t size) {
  try {
    return Lab::PerformRead<int>({"Sysnode_Get", NameOf(node)}, [&](const Lab::Json& state) {
      FillNode(state, node, buffer, size);
      return 0;
    });
  } catch (const NodeplaneException&) {
    return EIO;
  }
}

namespace Coreplane::Util {

void SysinfoUtil::SysinfoGet(SysinfoNode node, void* buffer, size_t size, const SysinfoParams*) {
  Lab::PerformRead<void>({"SysinfoUtil::SysinfoGet", NameOf(node)},
                         [&](const Lab::Json& state) { FillNode(state, node, buffer, size); });
}

}  // namespace Coreplane::Util
