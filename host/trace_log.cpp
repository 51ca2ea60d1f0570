#include "trace_log.h"

#include <cstdio>

#include "utf16_text.h"
#include "vtpl/host_interface.h"

namespace vtpl::host {

const char* messageName(int32_t message) {
  switch (message) {
    case kMessageCreateInstance:
      return "create instance";
    case kMessageDestroyInstance:
      return "destroy instance";
    case kMessageDeclareParameters:
      return "declare parameters";
    case kMessageCreateSharedData:
      return "create shared data";
    case kMessageDestroySharedData:
      return "destroy shared data";
    case kMessageParameterChanged:
      return "parameter changed";
    case kMessageSetUp:
      return "set up";
    case kMessageRender:
      return "render";
    case kMessageParameterEdited:
    case kMessageParameterEditedAlt:
      return "parameter edited";
    case kMessageAttach:
      return "attach control";
    case kMessageDetach:
      return "detach control";
    case kMessageDrawControl:
      return "draw control";
    default:
      return "unknown";
  }
}

std::string inQuotes(std::string_view text) {
  return "\"" + std::string(text) + "\"";
}

std::string inQuotes(std::u16string_view text) {
  return inQuotes(toUtf8(text));
}

std::string inQuotes(const char* text) {
  return text == nullptr ? std::string("null") : inQuotes(std::string_view(text));
}

std::string hex(uint32_t value) {
  char text[16];
  std::snprintf(text, sizeof text, "0x%X", value);
  return text;
}

void TraceLog::messageSent(int32_t message, std::string_view detail) {
  if (stream_ == nullptr) {
    return;
  }
  *stream_ << "> Notify " << message << " (" << messageName(message) << ")";
  if (!detail.empty()) {
    *stream_ << ' ' << detail;
  }
  *stream_ << '\n';
}

void TraceLog::messageAnswered(int32_t message, int32_t result) {
  if (stream_ != nullptr) {
    *stream_ << "< Notify " << message << " -> " << result << '\n';
  }
}

void TraceLog::callback(std::string_view name, std::string_view arguments,
                        std::string_view result) {
  if (stream_ == nullptr) {
    return;
  }
  *stream_ << "    " << name << '(' << arguments << ')';
  if (!result.empty()) {
    *stream_ << " -> " << result;
  }
  *stream_ << '\n';
}

}  // namespace vtpl::host
