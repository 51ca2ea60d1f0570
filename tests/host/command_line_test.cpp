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

TEST(CommandLine, RenderTakesAComparisonAndAControlPicture) {
  const CommandLine line =
      parseCommandLine({"render", "in.png", "-o", "out.png", "--compare", "b.png",
                        "--control=scope.png", "--control-size", "320x200"});
  EXPECT_EQ(line.input, "in.png");
  EXPECT_EQ(line.output, "out.png");
  EXPECT_EQ(line.comparison, "b.png");
  EXPECT_EQ(line.controlOutput, "scope.png");
  EXPECT_EQ(line.controlWidth, 320);
  EXPECT_EQ(line.controlHeight, 200);

  const CommandLine plain = parseCommandLine({"render", "in.png", "-o", "out.png"});
  EXPECT_TRUE(plain.comparison.empty());
  EXPECT_TRUE(plain.controlOutput.empty());
  EXPECT_EQ(plain.controlWidth, 500);
  EXPECT_EQ(plain.controlHeight, 300);
  EXPECT_EQ(
      parseCommandLine({"render", "in.png", "-o", "o.png", "--control-size=1x16384"}).controlHeight,
      16384);
}

TEST(CommandLine, DemoWritesIntoOutDemoUnlessTold) {
  const CommandLine line = parseCommandLine({"demo"});
  EXPECT_EQ(line.command, "demo");
  EXPECT_EQ(line.output, std::filesystem::path("out") / "demo");
  const CommandLine told = parseCommandLine({"demo", "-o", "/tmp/d", "--set", "blendType=Screen",
                                             "--compare", "b.png", "--control-size", "50x30"});
  EXPECT_EQ(told.output, "/tmp/d");
  EXPECT_EQ(told.comparison, "b.png");
  EXPECT_EQ(told.controlWidth, 50);
  EXPECT_EQ(told.controlHeight, 30);
  ASSERT_EQ(told.settings.size(), 1u);
}

TEST(CommandLine, RefusesMalformedControlSizesAndMisplacedOptions) {
  const std::vector<std::string> sizes = {
      "",      "x",     "500",  "500x", "x300",     "0x300", "500x0",         "-5x300",
      "+5x30", "5x3x2", "5 x3", "5X3",  "16385x10", "1e3x2", "99999999999x1", "5x3 "};
  for (const std::string& size : sizes) {
    EXPECT_THROW(parseCommandLine({"render", "i.png", "-o", "o.png", "--control-size", size}),
                 UsageError)
        << "'" << size << "'";
  }
  const std::vector<std::vector<std::string>> cases = {
      {"demo", "extra.png"},
      {"demo", "--control", "scope.png"},
      {"info", "--compare", "b.png"},
      {"info", "--control-size", "5x5"},
      {"info", "--control", "s.png"},
      {"render", "i.png", "-o", "o.png", "--compare"},
      {"render", "i.png", "-o", "o.png", "--control"},
  };
  for (const auto& arguments : cases) {
    EXPECT_THROW(parseCommandLine(arguments), UsageError) << testing::PrintToString(arguments);
  }
}

TEST(CommandLine, UsageNamesTheNewCommandAndOptions) {
  const std::string usage = usageText();
  for (const char* text : {"demo [-o DIR]", "--compare B.png", "--control SCOPE.png",
                           "--control-size WxH", "scopePositionTL"}) {
    EXPECT_NE(usage.find(text), std::string::npos) << text;
  }
}

}  // namespace
}  // namespace vtpl::host
