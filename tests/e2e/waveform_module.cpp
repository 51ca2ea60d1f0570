#include "waveform_module.h"

namespace waveform_test {

const vtpl::host::PluginModule& waveformModule() {
  static const vtpl::host::PluginModule module(WAVEFORM_MODULE_PATH);
  return module;
}

vtpl::host::HostSettings declaredStateSettings() {
  vtpl::host::HostSettings settings;
  settings.announceInitialValues = false;
  return settings;
}

std::unique_ptr<vtpl::host::EffectHost> openHost(vtpl::host::HostSettings settings,
                                                 std::ostream* trace) {
  auto host =
      std::make_unique<vtpl::host::EffectHost>(waveformModule(), std::move(settings), trace);
  host->open();
  return host;
}

}  // namespace waveform_test
