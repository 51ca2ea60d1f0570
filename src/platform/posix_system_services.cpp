// The system services on POSIX: fonts from fontconfig, the language from the locale
// environment, the module's folder from the dynamic linker, GUIDs from a seeded generator.
#include <dlfcn.h>
#include <link.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <mutex>
#include <random>
#include <system_error>

#include "platform/fontconfig_fonts.h"
#include "platform/system_services.h"
#include "platform/utf16_text.h"

namespace platform {
namespace {

// Any function of this file: the dynamic linker names the object its address lies in.
void addressInThisModule() {}

std::string executablePath() {
  std::error_code error;
  const std::filesystem::path path = std::filesystem::read_symlink("/proc/self/exe", error);
  return error ? std::string() : path.string();
}

// The file of the shared object or executable that holds this code. The dynamic linker names
// the main program by argv[0], which may be relative to a folder the process has left, so the
// executable is taken from /proc instead; a shared object's name is made absolute and free of
// links.
std::string modulePath() {
  Dl_info info{};
  link_map* module = nullptr;
  if (dladdr1(reinterpret_cast<void*>(&addressInThisModule), &info,
              reinterpret_cast<void**>(&module), RTLD_DL_LINKMAP) == 0) {
    return executablePath();
  }
  const bool isExecutable =
      module == nullptr || module->l_name == nullptr || module->l_name[0] == '\0';
  if (isExecutable || info.dli_fname == nullptr) {
    return executablePath();
  }
  std::error_code error;
  const std::filesystem::path path = std::filesystem::canonical(info.dli_fname, error);
  return error ? std::string(info.dli_fname) : path.string();
}

std::string folderOf(const std::string& file) {
  const size_t slash = file.rfind('/');
  return slash == std::string::npos ? std::string("./") : file.substr(0, slash + 1);
}

class PosixSystemServices final : public SystemServices {
 public:
  PosixSystemServices() : moduleFolder_(toUtf16(folderOf(modulePath()))) {
    std::random_device device;
    std::seed_seq seed{device(), device(), device(), device(),
                       device(), device(), device(), device()};
    generator_.seed(seed);
  }

  std::optional<std::u16string> fontsFolder() const override { return fonts_.fontsFolder(); }

  std::optional<std::vector<InstalledFont>> installedFonts(FontHive hive) const override {
    return fonts_.installedFonts(hive);
  }

  std::vector<EnumeratedFace> enumerateFamilies() const override { return fonts_.families(); }

  std::vector<EnumeratedFace> enumerateFaces(const std::u16string& faceName) const override {
    return fonts_.faces(faceName);
  }

  std::vector<uint8_t> fontData(const std::u16string& faceName, bool bold,
                                bool italic) const override {
    return fonts_.fontData(faceName, bold, italic);
  }

  // Read on every call, so a change of the locale environment is seen at once.
  uint16_t userLanguageId() const override { return userLanguageIdFromEnvironment(); }

  std::u16string moduleFolder() const override { return moduleFolder_; }

  std::array<uint8_t, 16> newGuid() const override {
    std::array<uint8_t, 16> guid{};
    {
      std::lock_guard<std::mutex> lock(generatorMutex_);
      for (size_t i = 0; i < guid.size(); i += 8) {
        uint64_t bits = generator_();
        for (size_t j = 0; j < 8; ++j, bits >>= 8) {
          guid[i + j] = static_cast<uint8_t>(bits);
        }
      }
    }
    guid[6] = static_cast<uint8_t>((guid[6] & 0x0F) | 0x40);  // version 4: random
    guid[8] = static_cast<uint8_t>((guid[8] & 0x3F) | 0x80);  // the RFC 4122 variant
    return guid;
  }

  bool isWideSpace(char32_t character) const override { return platform::isWideSpace(character); }

 private:
  FontconfigFonts fonts_;
  std::u16string moduleFolder_;
  mutable std::mutex generatorMutex_;
  mutable std::mt19937_64 generator_;
};

}  // namespace

std::shared_ptr<const SystemServices> createSystemServices() {
  return std::make_shared<const PosixSystemServices>();
}

std::shared_ptr<const SystemServices> systemServices() {
  static const std::shared_ptr<const SystemServices> services = createSystemServices();
  return services;
}

std::string guidText(const std::array<uint8_t, 16>& guid) {
  char text[37];
  std::snprintf(text, sizeof(text),
                "%02x%02x%02x%02x-%02x%02x-%02x%02x-%02x%02x-%02x%02x%02x%02x%02x%02x", guid[0],
                guid[1], guid[2], guid[3], guid[4], guid[5], guid[6], guid[7], guid[8], guid[9],
                guid[10], guid[11], guid[12], guid[13], guid[14], guid[15]);
  return text;
}

}  // namespace platform
