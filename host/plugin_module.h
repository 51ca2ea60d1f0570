// One loaded effect module: the shared library and its two entry points.
#ifndef VTPL_HOST_PLUGIN_MODULE_H
#define VTPL_HOST_PLUGIN_MODULE_H

#include <array>
#include <cstdint>
#include <filesystem>
#include <string>

#include "vtpl/host_interface.h"

namespace vtpl::host {

// What PluginInfo wrote, decoded.
struct PluginInformation {
  uint32_t header = 0;
  std::array<uint8_t, 16> guid{};
  std::u16string name;
  std::u16string category;
  std::u16string maker;
  std::u16string copyright;
  std::string bundleIdentifier;
  std::array<uint32_t, 4> version{};
  uint32_t descriptorSize = 0;
  uint32_t interfaceMagic = 0;
  uint64_t interfaceVersion = 0;
};

// "{XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX}" from the GUID's memory bytes.
std::string guidText(const std::array<uint8_t, 16>& guid);

class PluginModule {
 public:
  // Throws HostError naming the file when it cannot be loaded or lacks an entry point.
  explicit PluginModule(const std::filesystem::path& path);
  ~PluginModule();
  PluginModule(const PluginModule&) = delete;
  PluginModule& operator=(const PluginModule&) = delete;

  const std::filesystem::path& path() const { return path_; }
  PluginInfoFn pluginInfoEntry() const { return pluginInfo_; }
  NotifyFn notifyEntry() const { return notify_; }

  // Calls PluginInfo with buffers of the sizes the interface promises.
  PluginInformation information() const;

 private:
  std::filesystem::path path_;
  void* handle_ = nullptr;
  PluginInfoFn pluginInfo_ = nullptr;
  NotifyFn notify_ = nullptr;
};

}  // namespace vtpl::host

#endif  // VTPL_HOST_PLUGIN_MODULE_H
