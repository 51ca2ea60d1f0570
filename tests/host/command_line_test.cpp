// Parsing of the vtpl-host command line.
#include "command_line.h"

#include <gtest/gtest.h>

namespace vtpl::host {
namespace {

TEST(CommandLine, ReadsEveryOptionInBothForms) {
  const CommandLine line = parseCommandLine({"info", "--plugin", "/x/E.vtpl", "--trace", "--set",
                                             "a=1", "--set=b=two words", "--host-version=5300",
                                             "--host-id", "org.test", "--verbose"});
  EXPECT_EQ(line.command, "info");
  EXPECT_EQ(line.plugin, "/x/E.vtpl");
  EXPECT_TRUE(line.trace);
  EXPECT_TRUE(line.verbose);
  ASSERT_EQ(line.settings.size(), 2u);
  EXPECT_EQ(line.settings[0], (std::pair<std::string, std::string>{"a", "1"}));
  EXPECT_EQ(line.settings[1], (std::pair<std::string, std::string>{"b", "two words"}));
  EXPECT_EQ(line.hostVersion, 5300);
  EXPECT_EQ(line.hostIdentifier, "org.test");
}

TEST(CommandLine, DefaultsLeaveThePluginToTheTool) {
  const CommandLine line = parseCommandLine({"info"});
  EXPECT_TRUE(line.plugin.empty());
  EXPECT_FALSE(line.trace);
  EXPECT_FALSE(line.hostVersion.has_value());
  EXPECT_EQ(parseCommandLine({"--help"}).command, "help");
}

TEST(CommandLine, RefusesWhatItCannotUnderstand) {
  const std::vector<std::vector<std::string>> cases = {
      {},
      {"draw"},
      {"info", "extra"},
      {"info", "--plugin"},
      {"info", "--set", "novalue"},
      {"info", "--set", "=1"},
      {"info", "--host-version", "56x"},
      {"info", "--host-version", "99999999999"},
      {"info", "--frobnicate"},
  };
  for (const auto& arguments : cases) {
    EXPECT_THROW(parseCommandLine(arguments), UsageError) << testing::PrintToString(arguments);
  }
}

}  // namespace
}  // namespace vtpl::host
