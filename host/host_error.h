// Failures of the reference host itself (a module that does not load, a bad parameter value),
// reported to the user with a message that says what and where.
#ifndef VTPL_HOST_HOST_ERROR_H
#define VTPL_HOST_HOST_ERROR_H

#include <stdexcept>
#include <string>

namespace vtpl::host {

class HostError : public std::runtime_error {
 public:
  explicit HostError(const std::string& message) : std::runtime_error(message) {}
};

}  // namespace vtpl::host

#endif  // VTPL_HOST_HOST_ERROR_H
