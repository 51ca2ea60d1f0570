#include "gl/shader_log.h"

#include <cstdio>

namespace Plugin::gl {
namespace {

// Drivers spell the markers in any case: search an upper-cased copy.
bool mentionsWarningOrError(const std::string& text) {
  std::string upper = text;
  for (char& c : upper) {
    if (c >= 'a' && c <= 'z') {
      c = static_cast<char>(c - 'a' + 'A');
    }
  }
  return upper.find("WARNING") != std::string::npos || upper.find("ERROR") != std::string::npos;
}

}  // namespace

ShaderLog::~ShaderLog() {
  if (echo_ && !text_.empty() && mentionsWarningOrError(text_)) {
    std::fwrite(text_.data(), 1, text_.size(), stdout);
    std::fflush(stdout);
  }
  text_.clear();
}

void ShaderLog::append(const std::string& log) {
  if (log.empty()) {
    return;
  }
  if (!text_.empty()) {
    text_ += '\n';
  }
  text_ += log;
}

}  // namespace Plugin::gl
