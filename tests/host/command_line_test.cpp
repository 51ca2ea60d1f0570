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
  EXPECT_EQ(line.settings,
            (std::vector<std::pair<std::string, std::string>>{{"a", "1"}, {"b", "two words"}}));
  EXPECT_EQ(line.hostVersion, 5300);
  EXPECT_EQ(line.hostIdentifier, "org.test");
  EXPECT_EQ(parseCommandLine({"--help"}).command, "help");
}

TEST(CommandLine, RenderAndDemoTakeAComparisonAndAControlPicture) {
  const CommandLine line =
      parseCommandLine({"render", "in.png", "-o", "out.png", "--compare", "b.png",
                        "--control=scope.png", "--control-size", "320x200"});
  EXPECT_EQ(line.input, "in.png");
  EXPECT_EQ(line.output, "out.png");
  EXPECT_EQ(line.comparison, "b.png");
  EXPECT_EQ(line.controlOutput, "scope.png");
  EXPECT_EQ(std::pair(line.controlWidth, line.controlHeight), std::pair(320, 200));
  const CommandLine largest =
      parseCommandLine({"render", "in.png", "-o", "o.png", "--control-size=1x16384"});
  EXPECT_EQ(std::pair(largest.controlWidth, largest.controlHeight), std::pair(1, 16384));
  // Demo writes into out/demo unless told.
  EXPECT_EQ(parseCommandLine({"demo"}).output, std::filesystem::path("out") / "demo");
  const CommandLine told = parseCommandLine({"demo", "-o", "/tmp/d", "--set", "blendType=Screen",
                                             "--compare", "b.png", "--control-size", "50x30"});
  EXPECT_EQ(told.output, "/tmp/d");
  EXPECT_EQ(told.comparison, "b.png");
  EXPECT_EQ(std::pair(told.controlWidth, told.controlHeight), std::pair(50, 30));
  EXPECT_EQ(told.settings.size(), 1u);
}

TEST(CommandLine, RefusesWhatItCannotUnderstand) {
  std::vector<std::vector<std::string>> cases = {
      {},
      {"draw"},
      {"info", "extra"},
      {"info", "--plugin"},
      {"info", "--set", "novalue"},
      {"info", "--set", "=1"},
      {"info", "--host-version", "56x"},
      {"info", "--host-version", "99999999999"},
      {"info", "--frobnicate"},
      {"render", "i.png"},
      // Options of other commands.
      {"demo", "extra.png"},
      {"demo", "--control", "scope.png"},
      {"info", "--compare", "b.png"},
      {"info", "--control-size", "5x5"},
      {"info", "--control", "s.png"},
      {"render", "i.png", "-o", "o.png", "--compare"},
      {"render", "i.png", "-o", "o.png", "--control"},
  };
  for (const std::string size :
       {"", "x", "500", "500x", "x300", "0x300", "500x0", "-5x300", "+5x30", "5x3x2", "5 x3", "5X3",
        "16385x10", "1e3x2", "99999999999x1", "5x3 "}) {
    cases.push_back({"render", "i.png", "-o", "o.png", "--control-size", size});
  }
  for (const auto& arguments : cases) {
    EXPECT_THROW(parseCommandLine(arguments), UsageError) << testing::PrintToString(arguments);
  }
}

TEST(CommandLine, UsageNamesTheCommandsAndOptions) {
  const std::string usage = usageText();
  for (const char* text : {"demo [-o DIR]", "--compare B.png", "--control SCOPE.png",
                           "--control-size WxH", "scopePositionTL"}) {
    EXPECT_NE(usage.find(text), std::string::npos) << text;
  }
}

}  // namespace
}  // namespace vtpl::host
