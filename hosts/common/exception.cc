#include "hostapi/nodeplane/exception.h"

#include <utility>

namespace Nodeplane::Lib {

NodeplaneException::NodeplaneException(std::string message) : _message(std::move(message)) {}
NodeplaneException::NodeplaneException(const NodeplaneException&) = default;
NodeplaneException& NodeplaneException::operator=(const NodeplaneException&) = default;
NodeplaneException::~NodeplaneException() = default;

const char* NodeplaneException::what() const noexcept { return _message.c_str(); }

}  // namespace Nodeplane::Lib
