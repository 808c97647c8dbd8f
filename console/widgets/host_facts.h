#pragma once

#include <cstdint>
#include <string>

namespace Tarnel {

// Product, version, release type and build of the host in one line. Read once and kept; throws
// NodeplaneException, and tries again at the next call, while the kernel does not tell.
const std::string& GetProductLine();

// A size of memory as operators speak of it: raised to a multiple of 256 MiB, in the largest unit
// of MB, GB, TB and PB that does not exceed it, with at most one digit behind the point.
std::string FormatMemorySize(uint64_t bytes);

// Which version text of the host's hardware GetHardwareVersion() gives.
enum HardwareVersion : int {
  STORAGE_DRIVER_VERSION = 1,
  BMC_VERSION = 2,
  BIOS_VERSION = 3,
  ASSET_TAG = 4,
};

// "N/A" for an unknown id and for a storage adapter or driver that is not there. Throws
// NodeplaneException when the host or its firmware cannot be read.
std::string GetHardwareVersion(int versionId);

// The fingerprint in the output of openssl's x509 command; empty when there is none.
std::string ScanThumbprint(const std::string& output);

}  // namespace Tarnel
