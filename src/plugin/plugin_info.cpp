#include "plugin/plugin_info.h"

#include <cstdint>
#include <cstring>

namespace plugin::Scopes {
namespace {

// {CDE6FB0A-BF41-4524-A6BC-3BB8DAC569D6} in memory order: the first three groups little-endian.
constexpr uint8_t kEffectGuid[16] = {0x0A, 0xFB, 0xE6, 0xCD, 0x41, 0xBF, 0x24, 0x45,
                                     0xA6, 0xBC, 0x3B, 0xB8, 0xDA, 0xC5, 0x69, 0xD6};

// The host groups effects by the key in braces after the display name.
constexpr char16_t kEffectName[] = u"Waveform {scopes}";
constexpr char16_t kCategory[] = u"Scopes";
constexpr char16_t kMaker[] = u"Quorvel";
constexpr char16_t kCopyright[] = u"Copyright \u00A9 2026 Quorvel. All rights reserved.";
constexpr char kBundleIdentifier[] = "com.QUORVEL.Vantric.Scopes.Waveform";

constexpr uint32_t kVersion[4] = {1, 0, 0, 0};
constexpr uint32_t kDescriptorSize = 16;
constexpr uint32_t kInterfaceMagic = 0x089E31C7;
constexpr uint64_t kInterfaceVersion = 5;

template <typename Char>
void copyBoundedChars(Char* target, const Char* source, size_t bound) {
  if (target == nullptr) {
    return;
  }
  size_t count = 0;
  while (count < bound && source[count] != Char{0}) {
    target[count] = source[count];
    ++count;
  }
  if (count < bound) {
    target[count] = Char{0};
  }
}

}  // namespace

void copyBounded(char16_t* target, const char16_t* source, size_t bound) {
  copyBoundedChars(target, source, bound);
}

void copyBounded(char* target, const char* source, size_t bound) {
  copyBoundedChars(target, source, bound);
}

void fillPluginInfo(vtpl::PluginInfoRecord& info) {
  info.header = 0;
  std::memcpy(info.guid, kEffectGuid, sizeof kEffectGuid);
  copyBounded(info.name, kEffectName, vtpl::kInfoNameChars);
  copyBounded(info.category, kCategory, vtpl::kInfoCategoryChars);
  copyBounded(info.maker, kMaker, vtpl::kInfoMakerChars);
  copyBounded(info.copyright, kCopyright, vtpl::kInfoCopyrightChars);
  copyBounded(info.bundleIdentifier, kBundleIdentifier, vtpl::kInfoBundleIdentifierChars);
  info.interfaceMagic = kInterfaceMagic;
  // A u64 at an offset that is only 4-byte aligned: written as bytes.
  std::memcpy(info.interfaceVersion, &kInterfaceVersion, sizeof kInterfaceVersion);
  std::memcpy(info.version, kVersion, sizeof kVersion);
  info.descriptorSize = kDescriptorSize;
}

}  // namespace plugin::Scopes
