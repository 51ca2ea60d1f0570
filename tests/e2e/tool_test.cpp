// vtpl-host run as a user runs it: what it prints and how it fails.
#include <gtest/gtest.h>
#include <sys/wait.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <tuple>
#include <vector>

#include "image.h"
#include "test_frame.h"

namespace waveform_test {
namespace {

struct ToolRun {
  int exitCode = -1;
  std::string out;
  std::string err;
};

std::string shellQuoted(const std::string& text) {
  std::string quoted = "'";
  for (char c : text) {
    quoted += c == '\'' ? std::string("'\\''") : std::string(1, c);
  }
  return quoted + "'";
}

// Runs the tool (vtpl-host unless another is named) from `folder` when one is given, with
// `environment` ("NAME=value ...") added.
ToolRun runTool(const std::vector<std::string>& arguments, const std::string& folder = "",
                const std::string& environment = "", const char* tool = VTPL_HOST_TOOL_PATH) {
  // A file of its own: tests of the tool run at the same time under ctest -j.
  char errPath[] = "/tmp/vtpl-host-test-XXXXXX";
  const int errFile = mkstemp(errPath);
  EXPECT_GE(errFile, 0);
  std::string command = folder.empty() ? "" : "cd " + shellQuoted(folder) + " && ";
  command += environment.empty() ? "" : "env " + environment + " ";
  command += shellQuoted(tool);
  for (const std::string& argument : arguments) {
    command += " " + shellQuoted(argument);
  }
  command += " 2>" + shellQuoted(errPath);

  ToolRun run;
  FILE* pipe = popen(command.c_str(), "r");
  char buffer[4096];
  size_t count = 0;
  while ((count = std::fread(buffer, 1, sizeof buffer, pipe)) > 0) {
    run.out.append(buffer, count);
  }
  const int status = pclose(pipe);
  run.exitCode = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  std::ifstream errStream(errPath);
  run.err.assign(std::istreambuf_iterator<char>(errStream), {});
  close(errFile);
  std::remove(errPath);
  return run;
}

bool hasWord(const std::string& line, const std::string& word) {
  std::istringstream words(line);
  for (std::string w; words >> w;) {
    if (w == word) {
      return true;
    }
  }
  return false;
}

// The panel line of a parameter id, empty if the id is not printed.
std::string panelLine(const std::string& output, const std::string& id) {
  std::istringstream lines(output);
  for (std::string line; std::getline(lines, line);) {
    if (hasWord(line, id)) {
      return line;
    }
  }
  return "";
}

// Info prints the information and the panel on standard output; the trace of every message and
// callback goes to standard error.
TEST(Tool, InfoPrintsInformationAndThePanelTree) {
  const ToolRun run = runTool({"info", "--trace"});
  ASSERT_EQ(run.exitCode, 0) << run.err;
  EXPECT_NE(run.out.find("Waveform {scopes}\n"), std::string::npos);
  EXPECT_NE(run.out.find("{CDE6FB0A-BF41-4524-A6BC-3BB8DAC569D6}"), std::string::npos);
  EXPECT_NE(run.out.find("Parameters (25)"), std::string::npos);
  // Groups nest by indentation, each header on its own line before its parameters.
  EXPECT_NE(run.out.find("\n  Controls\n    Mode "), std::string::npos) << run.out;
  EXPECT_NE(run.out.find("\n    Clip\n      Start "), std::string::npos) << run.out;
  EXPECT_NE(run.out.find("\n      Position\n        Top-Left "), std::string::npos) << run.out;
  const std::string mode = panelLine(run.out, "waveformMode");
  EXPECT_TRUE(hasWord(mode, "choice")) << mode;
  EXPECT_TRUE(hasWord(mode, "shown")) << mode;
  EXPECT_NE(mode.find("Luminance=0 | RGB=1 | CbCr=4"), std::string::npos) << mode;
  const std::string brightness = panelLine(run.out, "waveformBrightness");
  EXPECT_NE(brightness.find("= 1.00; range 0.1 to 10, slider 0.1 to 2"), std::string::npos)
      << brightness;
  // The editor's opening announcements hide what Side by Side and blend None do not use.
  EXPECT_TRUE(hasWord(panelLine(run.out, "overlayChannels"), "hidden"));
  EXPECT_TRUE(hasWord(panelLine(run.out, "scopePositionTL"), "hidden"));

  EXPECT_EQ(run.out.find("Notify"), std::string::npos);
  EXPECT_NE(run.err.find("> Notify 2 (declare parameters)\n"), std::string::npos);
  EXPECT_NE(run.err.find("    defineChoice(label=\"Mode\", id=\"waveformMode\", flags=0x100, "
                         "items=\"Luminance|RGB|CbCr|Red|Green|Blue|Alpha\", "
                         "values=[0,1,4,5,6,7,8], default=0) -> 0\n"),
            std::string::npos);
  EXPECT_NE(run.err.find("< Notify 4 -> 1\n"), std::string::npos);
}

// --set changes values and visibility as a user's edits do, --host-version the layer's label;
// without --trace nothing reaches standard error. A plug-in path without folder is the file in the
// current folder.
TEST(Tool, SetAndHostVersionChangeThePanel) {
  const std::string module = WAVEFORM_MODULE_PATH;
  const size_t slash = module.rfind('/');
  const ToolRun run =
      runTool({"info", "--plugin", module.substr(slash + 1), "--set", "scopeComparisonType=Overlay",
               "--set=blendType=9", "--set", "waveformBrightness=0.5", "--host-version", "5300"},
              module.substr(0, slash));
  ASSERT_EQ(run.exitCode, 0) << run.err;
  EXPECT_EQ(run.err, "");
  EXPECT_TRUE(hasWord(panelLine(run.out, "overlayChannels"), "shown"));
  EXPECT_TRUE(hasWord(panelLine(run.out, "showComparison"), "hidden"));
  EXPECT_NE(panelLine(run.out, "blendType").find("= Multiply (default None)"), std::string::npos);
  EXPECT_TRUE(hasWord(panelLine(run.out, "scopePositionTL"), "shown"));
  EXPECT_NE(panelLine(run.out, "waveformBrightness").find("= 0.50 (default 1.00)"),
            std::string::npos);
  const std::string layer = panelLine(run.out, "overlayLayer");
  EXPECT_TRUE(hasWord(layer, "Layer")) << layer;
  EXPECT_EQ(layer.find("Compare To"), std::string::npos) << layer;
}

// Which arguments are refused is the command line's unit tests'; here how the tool reports a
// refusal (status 2, the reason and the usage) and failures of loading and setting (status 1).
TEST(Tool, FailuresSayWhatWentWrong) {
  struct Case {
    std::vector<std::string> arguments;
    int exitCode;
    std::string message;
  };
  const Case cases[] = {
      {{"info", "--plugin", "/nonexistent/Effect.vtpl"},
       1,
       "plug-in module '/nonexistent/Effect.vtpl' does not exist"},
      {{"info", "--plugin", NO_NOTIFY_MODULE_PATH},
       1,
       NO_NOTIFY_MODULE_PATH "' is not a plug-in module: it does not export 'Notify'"},
      {{"info", "--set", "noSuchParameter=1"}, 1, "no parameter has the id 'noSuchParameter'"},
      {{"info", "--colour"}, 2, "vtpl-host: unknown option '--colour'\n\nusage: vtpl-host"},
  };
  for (const Case& c : cases) {
    const ToolRun run = runTool(c.arguments);
    EXPECT_EQ(run.exitCode, c.exitCode) << c.message;
    EXPECT_NE(run.err.find(c.message), std::string::npos) << run.err;
    EXPECT_EQ(run.out, "") << c.message;
  }
}

// The host's test frame of this size written to a file of the test's temporary folder.
std::string writeTestFrame(const std::string& name, int width, int height) {
  const std::string path = testing::TempDir() + "/" + name;
  vtpl::host::writePng(path, vtpl::host::colourBarTestFrame(width, height));
  return path;
}

// Mesa can be told to offer GLSL 4.00 only: the effect's "#version 410" programs then fail to
// compile and message 8 answers 5 through the module. The failure and the driver's log reach
// standard error in any case; standard output echoes the log only when verbose.
TEST(Tool, DriverWithoutGlsl410FailsSetUpWithAResult) {
  const std::string picture = writeTestFrame("tool_glsl_in.png", 9, 3);
  const std::string oldGlsl = "MESA_GL_VERSION_OVERRIDE=4.1 MESA_GLSL_VERSION_OVERRIDE=400";
  for (const bool verbose : {false, true}) {
    std::vector<std::string> arguments = {"render", picture, "-o", picture + ".out.png"};
    if (verbose) {
      arguments.push_back("--verbose");
    }
    const ToolRun run = runTool(arguments, "", oldGlsl);
    EXPECT_EQ(run.exitCode, 1);
    EXPECT_NE(run.err.find("failed to set up its GL programs (Notify 8 returned 5)"),
              std::string::npos)
        << run.err;
    EXPECT_EQ(run.out.find("error") != std::string::npos, verbose) << run.out;
    const size_t failure = run.err.find("Waveform: GLSLErrorType_");
    ASSERT_NE(failure, std::string::npos) << run.err;
    EXPECT_NE(run.err.find("\nerror", failure), std::string::npos) << run.err;
  }
  std::remove(picture.c_str());
}

// A comparison layer, the render-to-layer settings (a choice by text, points, a colour) and the
// control's picture at the asked size are taken, from padded storage; the output keeps the frame's
// size. (Without render to layer the frame passes through unchanged: the demo's test.)
TEST(Tool, RenderTakesAComparisonLayerSettingsAndTheControlPicture) {
  const std::string in = writeTestFrame("tool_layer_in.png", 48, 27);
  const std::string other = writeTestFrame("tool_layer_b.png", 24, 14);
  const std::string out = in + ".out.png";
  const std::string scope = in + ".scope.png";
  const ToolRun run =
      runTool({"render", in, "-o", out, "--pad", "--compare", other, "--control", scope,
               "--control-size=64x40", "--set=blendType=Screen", "--set=scopePositionTL=0,13.5",
               "--set=scopePositionBR=24,-13.5", "--set=renderToLayerBackgroundColor=0.2,0.3,0.4",
               "--set=scopeComparisonType=Overlay", "--trace"});
  ASSERT_EQ(run.exitCode, 0) << run.err;
  EXPECT_EQ(run.out, "");
  EXPECT_NE(run.err.find("getPoint(\"scopePositionBR\", t=0) -> (24, -13.5)"), std::string::npos);
  EXPECT_NE(run.err.find("fetchLayer(\"c0a1b2c3-"), std::string::npos);
  const vtpl::host::Image output = vtpl::host::readPng(out);
  const vtpl::host::Image picture = vtpl::host::readPng(scope);
  EXPECT_EQ(std::tie(output.width, output.height, picture.width, picture.height, picture.bitDepth),
            std::tuple(48, 27, 64, 40, 8));
  const ToolRun missing = runTool({"render", in, "-o", out, "--compare", in + ".none.png"});
  EXPECT_EQ(missing.exitCode, 1);
  EXPECT_NE(missing.err.find(".none.png"), std::string::npos) << missing.err;
  for (const std::string& path : {in, other, out, scope}) {
    std::remove(path.c_str());
  }
}

// As the editor applies the effect, the tool reports the picture as the effect's parent layer
// before the first render (a 27-row picture is measured in Rec. 601), and spans the analysed
// rectangle and the scope's corners over the picture unless --set or --keep-defaults say otherwise.
TEST(Tool, RenderTellsTheEffectItsLayerAndSpansThePicture) {
  const std::string in = writeTestFrame("tool_span_in.png", 48, 27);
  const std::string out = in + ".out.png";
  struct Case {
    std::vector<std::string> options;
    const char* clipStart;
    const char* scopeBottomRight;
  };
  const Case cases[] = {
      {{}, "(-24, -13.5)", "(24, -13.5)"},
      {{"--keep-defaults"}, "(-640, -360)", "(640, -360)"},
      {{"--set", "clipStartPos=-5,-5"}, "(-5, -5)", "(24, -13.5)"},
  };
  for (const Case& c : cases) {
    std::vector<std::string> arguments = {"render", in,        "-o",
                                          out,      "--trace", "--set=blendType=Screen"};
    arguments.insert(arguments.end(), c.options.begin(), c.options.end());
    const ToolRun run = runTool(arguments);
    ASSERT_EQ(run.exitCode, 0) << run.err;
    const size_t parent = run.err.find("(parameter changed) \"Effect_Parent_Layer\"\n");
    EXPECT_LT(parent, run.err.find("> Notify 10 (render)"));
    EXPECT_NE(run.err.find("setInt(\"colorSpace\", t=0, 601)", parent), std::string::npos);
    EXPECT_NE(run.err.find(std::string("getPoint(\"clipStartPos\", t=0) -> ") + c.clipStart),
              std::string::npos)
        << c.clipStart;
    EXPECT_NE(
        run.err.find(std::string("getPoint(\"scopePositionBR\", t=0) -> ") + c.scopeBottomRight),
        std::string::npos)
        << c.scopeBottomRight;
  }
  for (const std::string& path : {in, out}) {
    std::remove(path.c_str());
  }
}

// Without -o, demo writes into out/demo of the current folder, creating it, and prints the paths.
TEST(Tool, DemoWritesTheTestFrameTheOutputAndTheScope) {
  const std::string folder = testing::TempDir() + "/tool_demo";
  std::filesystem::remove_all(folder);
  std::filesystem::create_directories(folder);
  const ToolRun run = runTool({"demo", "--control-size", "100x60"}, folder);
  ASSERT_EQ(run.exitCode, 0) << run.err;
  EXPECT_EQ(run.out, "out/demo/test-frame.png\nout/demo/output.png\nout/demo/scope.png\n");
  const vtpl::host::Image frame = vtpl::host::readPng(folder + "/out/demo/test-frame.png");
  // The frame the point parameters' defaults span, so that the whole frame is analysed.
  EXPECT_EQ(std::tie(frame.width, frame.height), std::tuple(1280, 720));
  // Without render to layer the frame passes through unchanged.
  EXPECT_EQ(vtpl::host::readPng(folder + "/out/demo/output.png").rgba, frame.rgba);
  const vtpl::host::Image scope = vtpl::host::readPng(folder + "/out/demo/scope.png");
  EXPECT_EQ(std::tie(scope.width, scope.height), std::tuple(100, 60));
  std::filesystem::remove_all(folder);
}

// vtpl-fonts prints the effect's font catalogue of this machine (fonts-dejavu-core installed).
TEST(Tool, FontsListsTheCatalogueAndFindsNames) {
  const auto fonts = [](const std::vector<std::string>& arguments) {
    return runTool(arguments, "", "", VTPL_FONTS_TOOL_PATH);
  };
  const ToolRun all = fonts({});
  ASSERT_EQ(all.exitCode, 0) << all.err;
  EXPECT_EQ(all.out.rfind("Fonts folder: /", 0), 0u) << all.out;
  EXPECT_NE(all.out.find("\nDejaVuSans | DejaVu Sans | DejaVu Sans | Book | "
                         "/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf | 0 | 0 | "),
            std::string::npos)
      << all.out;
  // One family only.
  const ToolRun family = fonts({"--family", "DejaVu Sans Mono"});
  ASSERT_EQ(family.exitCode, 0) << family.err;
  EXPECT_NE(family.out.find("\nDejaVuSansMono-Bold | DejaVu Sans Mono Bold | DejaVu Sans Mono | "),
            std::string::npos)
      << family.out;
  EXPECT_EQ(family.out.find("\nDejaVuSans |"), std::string::npos) << family.out;
  const ToolRun found = fonts({"--find", "DejaVu Sans Bold"});
  EXPECT_EQ(found.exitCode, 0) << found.err;
  EXPECT_NE(found.out.find("\nDejaVuSans-Bold | DejaVu Sans Bold | "), std::string::npos)
      << found.out;
  const ToolRun missing = fonts({"--find", "No Such Font Anywhere"});
  EXPECT_EQ(missing.exitCode, 1);
  EXPECT_NE(missing.out.find("not installed"), std::string::npos) << missing.out;
  EXPECT_EQ(fonts({"--size"}).exitCode, 2);
  const ToolRun help = runTool({"help"});  // vtpl-host help prints the usage
  EXPECT_EQ(help.exitCode, 0);
  EXPECT_EQ(help.out.rfind("usage: vtpl-host COMMAND", 0), 0u) << help.out;
}

// vtpl-text bidi on a mixed sentence typed with escapes: classes, levels and the visual order.
TEST(VtplTextTool, PrintsLevelsAndVisualOrderOfAMixedSentence) {
  const ToolRun run = runTool({"bidi", "ok \\u05D0\\u05D1 12!"}, "", "", VTPL_TEXT_TOOL_PATH);
  EXPECT_EQ(run.exitCode, 0) << run.err;
  for (const char* line :
       {"paragraph 1: level 0", "  U+05D0  R    1", "  U+0031  EN   2", "  U+0021  ON   0",
        "  visual order: U+006F U+006B U+0020 U+0031 U+0032 U+0020 U+05D1 "
        "U+05D0 U+0021"}) {
    EXPECT_NE(run.out.find(std::string(line) + "\n"), std::string::npos) << line << "\n" << run.out;
  }
  const ToolRun rightToLeft = runTool({"bidi", "--rtl", "ok"}, "", "", VTPL_TEXT_TOOL_PATH);
  EXPECT_NE(rightToLeft.out.find("  U+006F  L    2\n"), std::string::npos) << rightToLeft.out;
  for (const std::vector<std::string>& wrong : {std::vector<std::string>{"bidi", "\\u05"},
                                                {"bidi"},
                                                {"levels", "a"},
                                                {"bidi", "--up", "a"}}) {
    const ToolRun failed = runTool(wrong, "", "", VTPL_TEXT_TOOL_PATH);
    EXPECT_EQ(failed.exitCode, 2);
    EXPECT_NE(failed.err.find("usage: vtpl-text bidi"), std::string::npos) << failed.err;
  }
}

}  // namespace
}  // namespace waveform_test
