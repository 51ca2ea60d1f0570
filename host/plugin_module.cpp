#include "plugin_module.h"

#include <dlfcn.h>

#include <cstdio>
#include <cstring>
#include <vector>

#include "host_error.h"

namespace vtpl::host {
namespace {

// Reads a string the module wrote into a buffer of `capacity` characters; a string that fills
// the buffer has no terminator.
template <typename Char>
std::basic_string<Char> boundedString(const std::vector<Char>& buffer) {
  size_t length = 0;
  while (length < buffer.size() && buffer[length] != Char{0}) {
    ++length;
  }
  return std::basic_string<Char>(buffer.data(), length);
}

}  // namespace

std::string guidText(const std::array<uint8_t, 16>& g) {
  char text[40];
  std::snprintf(text, sizeof text,
                "{%02X%02X%02X%02X-%02X%02X-%02X%02X-%02X%02X-%02X%02X%02X%02X%02X%02X}", g[3],
                g[2], g[1], g[0], g[5], g[4], g[7], g[6], g[8], g[9], g[10], g[11], g[12], g[13],
                g[14], g[15]);
  return text;
}

PluginModule::PluginModule(const std::filesystem::path& path) : path_(path) {
  std::error_code error;
  if (!std::filesystem::is_regular_file(path, error)) {
    throw HostError("plug-in module '" + path.string() + "' does not exist or is not a file");
  }
  // A name without a folder would send dlopen searching the library path instead of the file.
  const std::filesystem::path file = std::filesystem::absolute(path, error);
  handle_ = dlopen(file.c_str(), RTLD_NOW | RTLD_LOCAL);
  if (handle_ == nullptr) {
    throw HostError("cannot load plug-in module '" + path.string() + "': " + dlerror());
  }
  pluginInfo_ = reinterpret_cast<PluginInfoFn>(dlsym(handle_, kPluginInfoSymbol));
  notify_ = reinterpret_cast<NotifyFn>(dlsym(handle_, kNotifySymbol));
  const char* missing = pluginInfo_ == nullptr ? kPluginInfoSymbol
                        : notify_ == nullptr   ? kNotifySymbol
                                               : nullptr;
  if (missing != nullptr) {
    dlclose(handle_);
    throw HostError("'" + path.string() + "' is not a plug-in module: it does not export '" +
                    missing + "'");
  }
}

PluginModule::~PluginModule() {
  dlclose(handle_);
}

PluginInformation PluginModule::information() const {
  std::vector<char16_t> name(kInfoNameChars, 0);
  std::vector<char16_t> category(kInfoCategoryChars, 0);
  std::vector<char16_t> maker(kInfoMakerChars, 0);
  std::vector<char16_t> copyright(kInfoCopyrightChars, 0);
  std::vector<char> bundle(kInfoBundleIdentifierChars, 0);

  PluginInfoRecord record{};
  record.name = name.data();
  record.category = category.data();
  record.maker = maker.data();
  record.copyright = copyright.data();
  record.bundleIdentifier = bundle.data();
  pluginInfo_(nullptr, nullptr, &record);

  PluginInformation info;
  info.header = record.header;
  std::memcpy(info.guid.data(), record.guid, sizeof record.guid);
  info.name = boundedString(name);
  info.category = boundedString(category);
  info.maker = boundedString(maker);
  info.copyright = boundedString(copyright);
  info.bundleIdentifier = boundedString(bundle);
  std::memcpy(info.version.data(), record.version, sizeof record.version);
  info.descriptorSize = record.descriptorSize;
  info.interfaceMagic = record.interfaceMagic;
  std::memcpy(&info.interfaceVersion, record.interfaceVersion, sizeof info.interfaceVersion);
  return info;
}

}  // namespace vtpl::host
