// When the collected shader logs reach standard output.
#include "gl/shader_log.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using Plugin::gl::ShaderLog;

std::string printedBy(const std::vector<std::string>& logs, bool echo) {
  testing::internal::CaptureStdout();
  {
    ShaderLog log(echo);
    for (const std::string& text : logs) {
      log.append(text);
    }
  }
  return testing::internal::GetCapturedStdout();
}

TEST(ShaderLog, PrintsWithEchoWhenAWarningOrErrorIsMentionedInAnyCase) {
  struct Case {
    std::vector<std::string> logs;
    bool echo;
    std::string printed;
  };
  const Case cases[] = {
      {{"0:3(1): warning: unused"}, true, "0:3(1): warning: unused"},
      {{"0:1: Error: bad"}, true, "0:1: Error: bad"},
      {{"compile", "", "link ERROR"}, true, "compile\nlink ERROR"},
      {{"all fine"}, true, ""},
      {{"0:3(1): warning: unused"}, false, ""},
      {{"", ""}, true, ""},
  };
  for (const Case& c : cases) {
    EXPECT_EQ(printedBy(c.logs, c.echo), c.printed);
  }
}

TEST(ShaderLog, AppendSeparatesLogsWithOneNewline) {
  ShaderLog log(false);
  log.append("");
  log.append("first");
  log.append("");
  log.append("second");
  EXPECT_EQ(log.text(), "first\nsecond");
}

}  // namespace
