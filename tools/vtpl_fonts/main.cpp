// vtpl-fonts: the catalogue of installed fonts as the plug-in sees it, for a user whose labels do
// not come out in the font they expect. Unlike vtpl-host this tool runs the effect's own font
// code, so that what it prints is exactly what the effect finds.
//   vtpl-fonts [--family NAME] [--find NAME]
#include <cstdio>
#include <exception>
#include <string>
#include <vector>

#include "fonts/font_cache.h"
#include "platform/utf16_text.h"

namespace {

using vesk::project::FontCache;
using vesk::project::FontRecord;

std::string utf8(const std::u16string& text) {
  return platform::toUtf8(text);
}

std::u16string utf16(const std::string& text) {
  return vesk::project::utf8ToUtf16(text);
}

void printRecord(const FontRecord& record) {
  std::printf("%s | %s | %s | %s | %s | %d | %d | %.4g\n", utf8(record.postScriptName).c_str(),
              utf8(record.fullName).c_str(), utf8(record.familyName).c_str(),
              utf8(record.styleName).c_str(),
              record.filePath.empty() ? "(no file)" : utf8(record.filePath).c_str(),
              record.faceIndex, record.instanceId, record.strikeoutPosition);
}

void printHeading() {
  std::printf(
      "PostScript name | full name | family | style | file | face | instance | strikeout "
      "position (em)\n");
}

int usage() {
  std::fprintf(stderr,
               "usage: vtpl-fonts [--family NAME] [--find NAME]\n"
               "  lists the installed fonts as the Waveform effect's catalogue holds them;\n"
               "  --family NAME  only the faces of that family\n"
               "  --find NAME    the face the effect uses for a font name, and whether the name\n"
               "                 itself is installed (otherwise the default font is used; exit\n"
               "                 status 1)\n");
  return 2;
}

}  // namespace

int main(int argc, char** argv) {
  std::string family;
  std::string find;
  for (int i = 1; i < argc; ++i) {
    const std::string argument = argv[i];
    if ((argument == "--family" || argument == "--find") && i + 1 < argc) {
      (argument == "--family" ? family : find) = argv[++i];
    } else {
      return usage();
    }
  }
  try {
    const std::shared_ptr<FontCache> cache = FontCache::instance();
    if (!find.empty()) {
      const bool installed = vesk::project::isFontAvailable(utf16(find).c_str());
      std::printf("\"%s\" is %s; the effect uses:\n", find.c_str(),
                  installed ? "installed" : "not installed, so the default font stands in");
      printHeading();
      printRecord(vesk::project::fontRecordForName(utf16(find)));
      return installed ? 0 : 1;
    }
    const std::vector<FontRecord> records = cache->records();
    std::printf("Fonts folder: %s\n%zu faces in %zu families\n", utf8(cache->fontsFolder()).c_str(),
                records.size(), cache->familyNames().size());
    printHeading();
    for (const FontRecord& record : records) {
      if (family.empty() || record.familyName == utf16(family)) {
        printRecord(record);
      }
    }
  } catch (const std::exception& error) {
    std::fprintf(stderr, "vtpl-fonts: %s\n", error.what());
    return 1;
  }
  return 0;
}
