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

struct InfoBuffers {
  std::vector<char16_t> name = std::vector<char16_t>(vtpl::kInfoNameChars, kWideSentinel);
  std::vector<char16_t> category = std::vector<char16_t>(vtpl::kInfoCategoryChars, kWideSentinel);
  std::vector<char16_t> maker = std::vector<char16_t>(vtpl::kInfoMakerChars, kWideSentinel);
  std::vector<char16_t> copyright = std::vector<char16_t>(vtpl::kInfoCopyrightChars, kWideSentinel);
  std::vector<char> bundle = std::vector<char>(vtpl::kInfoBundleIdentifierChars, char(kSentinel));
};

vtpl::PluginInfoRecord sentinelRecord(InfoBuffers& buffers, bool withBundle) {
  vtpl::PluginInfoRecord record;
  std::memset(&record, kSentinel, sizeof record);
  record.name = buffers.name.data();
  record.category = buffers.category.data();
  record.maker = buffers.maker.data();
  record.copyright = buffers.copyright.data();
  record.bundleIdentifier = withBundle ? buffers.bundle.data() : nullptr;
  return record;
}

// The string, its terminator, and the untouched buffer after it.
template <typename Char>
void expectTerminatedString(const std::vector<Char>& buffer, const std::basic_string<Char>& text,
                            Char sentinel) {
  ASSERT_LT(text.size(), buffer.size());
  EXPECT_EQ(std::basic_string<Char>(buffer.data(), text.size()), text);
  EXPECT_EQ(buffer[text.size()], Char{0});
  for (size_t i = text.size() + 1; i < buffer.size(); ++i) {
    ASSERT_EQ(buffer[i], sentinel) << "written past the terminator at " << i;
  }
}

template <typename T>
T readAt(const vtpl::PluginInfoRecord& record, size_t offset) {
  T value;
  std::memcpy(&value, reinterpret_cast<const uint8_t*>(&record) + offset, sizeof value);
  return value;
}

void expectUntouched(const vtpl::PluginInfoRecord& record, size_t from, size_t to) {
  for (size_t offset = from; offset < to; ++offset) {
    EXPECT_EQ(readAt<uint8_t>(record, offset), kSentinel) << "byte " << offset;
  }
}

void expectFixedFields(const vtpl::PluginInfoRecord& record) {
  const uint8_t guid[16] = {0x0A, 0xFB, 0xE6, 0xCD, 0x41, 0xBF, 0x24, 0x45,
                            0xA6, 0xBC, 0x3B, 0xB8, 0xDA, 0xC5, 0x69, 0xD6};
  EXPECT_EQ(readAt<uint32_t>(record, 0), 0u);
  EXPECT_EQ(std::memcmp(reinterpret_cast<const uint8_t*>(&record) + 4, guid, 16), 0);
  expectUntouched(record, 20, 24);
  EXPECT_EQ(readAt<uint32_t>(record, 56), 1u);
  EXPECT_EQ(readAt<uint32_t>(record, 60), 0u);
  EXPECT_EQ(readAt<uint32_t>(record, 64), 0u);
  EXPECT_EQ(readAt<uint32_t>(record, 68), 0u);
  EXPECT_EQ(readAt<uint32_t>(record, 72), 16u);
  expectUntouched(record, 76, 88);
  EXPECT_EQ(readAt<uint32_t>(record, 88), 0x089E31C7u);
  EXPECT_EQ(readAt<uint32_t>(record, 92), 5u);
  EXPECT_EQ(readAt<uint32_t>(record, 96), 0u);
  expectUntouched(record, 100, 104);
}

TEST(PluginInfo, WritesEveryFieldWithBundleIdentifier) {
  InfoBuffers buffers;
  vtpl::PluginInfoRecord record = sentinelRecord(buffers, true);
  waveformModule().pluginInfoEntry()(nullptr, nullptr, &record);

  expectFixedFields(record);
  expectTerminatedString(buffers.name, std::u16string(u"Waveform {scopes}"), kWideSentinel);
  expectTerminatedString(buffers.category, std::u16string(u"Scopes"), kWideSentinel);
  expectTerminatedString(buffers.maker, std::u16string(u"Quorvel"), kWideSentinel);
  expectTerminatedString(buffers.bundle, std::string("com.QUORVEL.Vantric.Scopes.Waveform"),
                         char(kSentinel));
  const std::u16string copyright(buffers.copyright.data());
  EXPECT_NE(copyright.find(u"Quorvel"), std::u16string::npos);
  EXPECT_NE(copyright.find(u"Copyright"), std::u16string::npos);
  expectTerminatedString(buffers.copyright, copyright, kWideSentinel);
  // The pointers themselves are the host's and stay as they were.
  EXPECT_EQ(record.name, buffers.name.data());
  EXPECT_EQ(record.bundleIdentifier, buffers.bundle.data());
}

TEST(PluginInfo, NullBundleIdentifierIsSkipped) {
  InfoBuffers buffers;
  vtpl::PluginInfoRecord record = sentinelRecord(buffers, false);
  waveformModule().pluginInfoEntry()(nullptr, nullptr, &record);

  expectFixedFields(record);
  EXPECT_EQ(record.bundleIdentifier, nullptr);
  expectTerminatedString(buffers.name, std::u16string(u"Waveform {scopes}"), kWideSentinel);
  expectTerminatedString(buffers.maker, std::u16string(u"Quorvel"), kWideSentinel);
}

TEST(PluginInfo, NullRecordIsIgnored) {
  waveformModule().pluginInfoEntry()(nullptr, nullptr, nullptr);
  SUCCEED();  // reaching here without a fault is the check
}

TEST(PluginInfo, HostDecodesTheInformation) {
  const vtpl::host::PluginInformation info = waveformModule().information();
  EXPECT_EQ(vtpl::host::guidText(info.guid), "{CDE6FB0A-BF41-4524-A6BC-3BB8DAC569D6}");
  EXPECT_EQ(info.interfaceVersion, 5u);
  EXPECT_EQ(info.version, (std::array<uint32_t, 4>{1, 0, 0, 0}));
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
