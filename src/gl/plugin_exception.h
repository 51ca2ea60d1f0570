// The effect's own failure: a standard exception carrying one of a few fixed texts. Notify turns
// it into result 5.
#ifndef WAVEFORM_GL_PLUGIN_EXCEPTION_H
#define WAVEFORM_GL_PLUGIN_EXCEPTION_H

#include <exception>

namespace Plugin::gl {

// The fixed texts. The exception keeps only the pointer, so only texts with static lifetime may
// be used.
inline constexpr const char kPluginErrorText[] = "Plugin Error";
inline constexpr const char kUnableToLinkShaderText[] = "Unable to link shader";
inline constexpr const char kUnableToLinkClearShaderText[] = "Unable to link clear shader.";

class PluginException : public std::exception {
 public:
  explicit PluginException(const char* text) noexcept : text_(text) {}
  const char* what() const noexcept override { return text_; }

 private:
  const char* text_;
};

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_PLUGIN_EXCEPTION_H
