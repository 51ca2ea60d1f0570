// The effect's own failure: a standard exception carrying one of a few fixed texts. Notify turns
// it into result 5.
#ifndef WAVEFORM_HOST_ACCESS_PLUGIN_EXCEPTION_H
#define WAVEFORM_HOST_ACCESS_PLUGIN_EXCEPTION_H

#include <exception>

namespace Plugin::host {

// The fixed text. The exception keeps only the pointer, so only texts with static lifetime may
// be used.
inline constexpr const char kPluginErrorText[] = "Plugin Error";

class PluginException : public std::exception {
 public:
  explicit PluginException(const char* text) noexcept : text_(text) {}
  const char* what() const noexcept override { return text_; }

 private:
  const char* text_;
};

}  // namespace Plugin::host

#endif  // WAVEFORM_HOST_ACCESS_PLUGIN_EXCEPTION_H
