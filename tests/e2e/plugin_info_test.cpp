// The bytes PluginInfo writes into the host's information record, and the module's exports.
#include <gtest/gtest.h>

#include <cstdio>
#include <cstring>
#include <set>
#include <sstream>
#include <string>
#include <vector>

#include "waveform_module.h"

namespace waveform_test {
namespace {

constexpr uint8_t kSentinel = 0xAB;
constexpr char16_t kWideSentinel = 0xABAB;

// The string, its terminator, and the untouched buffer after it.
template <typename Char>
void expectTerminatedString(const std::vector<Char>& buffer, const std::basic_string<Char>& text) {
  const Char sentinel = sizeof(Char) == 1 ? Char(kSentinel) : Char(kWideSentinel);
  ASSERT_LT(text.size(), buffer.size());
  EXPECT_EQ(std::basic_string<Char>(buffer.data(), text.size()), text);
  EXPECT_EQ(buffer[text.size()], Char{0});
  for (size_t i = text.size() + 1; i < buffer.size(); ++i) {
    ASSERT_EQ(buffer[i], sentinel) << "written past the terminator at " << i;
  }
}

// A record and buffers filled with sentinels; the module writes its fields and leaves the
// reserved bytes and the host's pointers alone, with or without a bundle identifier buffer.
TEST(PluginInfo, WritesEveryFieldAndNothingElse) {
  const uint8_t guid[16] = {0x0A, 0xFB, 0xE6, 0xCD, 0x41, 0xBF, 0x24, 0x45,
                            0xA6, 0xBC, 0x3B, 0xB8, 0xDA, 0xC5, 0x69, 0xD6};
  // {offset, value} of the 32-bit words: header, version, descriptor size, magic, interface.
  const std::pair<size_t, uint32_t> words[] = {
      {0, 0}, {56, 1}, {60, 0}, {64, 0}, {68, 0}, {72, 16}, {88, 0x089E31C7}, {92, 5}, {96, 0}};
  const std::pair<size_t, size_t> reserved[] = {{20, 24}, {76, 88}, {100, 104}};
  for (const bool withBundle : {true, false}) {
    SCOPED_TRACE(withBundle ? "with bundle identifier" : "without bundle identifier");
    std::vector<char16_t> name(vtpl::kInfoNameChars, kWideSentinel);
    std::vector<char16_t> category(vtpl::kInfoCategoryChars, kWideSentinel);
    std::vector<char16_t> maker(vtpl::kInfoMakerChars, kWideSentinel);
    std::vector<char16_t> copyright(vtpl::kInfoCopyrightChars, kWideSentinel);
    std::vector<char> bundle(vtpl::kInfoBundleIdentifierChars, char(kSentinel));
    vtpl::PluginInfoRecord record;
    std::memset(&record, kSentinel, sizeof record);
    record.name = name.data();
    record.category = category.data();
    record.maker = maker.data();
    record.copyright = copyright.data();
    record.bundleIdentifier = withBundle ? bundle.data() : nullptr;
    waveformModule().pluginInfoEntry()(nullptr, nullptr, &record);

    const auto* bytes = reinterpret_cast<const uint8_t*>(&record);
    EXPECT_EQ(std::memcmp(bytes + 4, guid, 16), 0);
    for (const auto& [offset, value] : words) {
      uint32_t word = 0;
      std::memcpy(&word, bytes + offset, 4);
      EXPECT_EQ(word, value) << "word at " << offset;
    }
    for (const auto& [from, to] : reserved) {
      for (size_t offset = from; offset < to; ++offset) {
        EXPECT_EQ(bytes[offset], kSentinel) << "byte " << offset;
      }
    }
    EXPECT_EQ(record.name, name.data());
    EXPECT_EQ(record.bundleIdentifier, withBundle ? bundle.data() : nullptr);
    expectTerminatedString(name, std::u16string(u"Waveform {scopes}"));
    expectTerminatedString(category, std::u16string(u"Scopes"));
    expectTerminatedString(maker, std::u16string(u"Quorvel"));
    const std::u16string copyrightText(copyright.data());
    EXPECT_NE(copyrightText.find(u"Copyright"), std::u16string::npos);
    EXPECT_NE(copyrightText.find(u"Quorvel"), std::u16string::npos);
    expectTerminatedString(copyright, copyrightText);
    if (withBundle) {
      expectTerminatedString(bundle, std::string("com.QUORVEL.Vantric.Scopes.Waveform"));
    }
  }
  waveformModule().pluginInfoEntry()(nullptr, nullptr, nullptr);  // a null record is ignored
}

TEST(ModuleExports, OnlyPluginInfoAndNotifyAreExported) {
  const std::string command = std::string("nm -D --defined-only ") + WAVEFORM_MODULE_PATH;
  FILE* pipe = popen(command.c_str(), "r");
  ASSERT_NE(pipe, nullptr);
  std::set<std::string> exported;
  char line[1024];
  while (std::fgets(line, sizeof line, pipe) != nullptr) {
    std::istringstream fields(line);
    std::string address, type, name;
    fields >> address >> type >> name;
    EXPECT_EQ(type, "T") << line;
    exported.insert(name);
  }
  ASSERT_EQ(pclose(pipe), 0) << command;
  EXPECT_EQ(exported, (std::set<std::string>{"Notify", "PluginInfo"}));
}

}  // namespace
}  // namespace waveform_test
