// Collects the GL info logs of one building operation and, when it ends (normally or while an
// exception passes), prints them if echo is on and they hold a warning or an error.
#ifndef WAVEFORM_GL_SHADER_LOG_H
#define WAVEFORM_GL_SHADER_LOG_H

#include <string>

namespace Plugin::gl {

class ShaderLog {
 public:
  explicit ShaderLog(bool echo) : echo_(echo) {}
  ~ShaderLog();
  ShaderLog(const ShaderLog&) = delete;
  ShaderLog& operator=(const ShaderLog&) = delete;

  // An empty log adds nothing; logs after the first are separated by a newline.
  void append(const std::string& log);
  const std::string& text() const { return text_; }

 private:
  std::string text_;
  bool echo_;
};

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_SHADER_LOG_H
