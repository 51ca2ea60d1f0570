// The --trace log: every message the host sends and every callback the effect makes, with its
// arguments and result, indented under the message it belongs to.
#ifndef VTPL_HOST_TRACE_LOG_H
#define VTPL_HOST_TRACE_LOG_H

#include <cstdint>
#include <ostream>
#include <string>
#include <string_view>

namespace vtpl::host {

// A short name for a Notify message code ("declare parameters"); "unknown" for others.
const char* messageName(int32_t message);

// Formatting of callback arguments.
std::string inQuotes(std::string_view text);
std::string inQuotes(std::u16string_view text);
std::string inQuotes(const char* text);  // null prints as null
std::string hex(uint32_t value);

class TraceLog {
 public:
  // A null stream turns tracing off.
  explicit TraceLog(std::ostream* stream = nullptr) : stream_(stream) {}
  bool enabled() const { return stream_ != nullptr; }

  void messageSent(int32_t message, std::string_view detail);
  void messageAnswered(int32_t message, int32_t result);
  void callback(std::string_view name, std::string_view arguments, std::string_view result);

 private:
  std::ostream* stream_;
};

}  // namespace vtpl::host

#endif  // VTPL_HOST_TRACE_LOG_H
