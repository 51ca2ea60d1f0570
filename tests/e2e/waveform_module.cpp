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

vtpl::host::HostSettings glSettings(bool padTextures) {
  vtpl::host::HostSettings settings = declaredStateSettings();
  settings.gl = true;
  settings.padTextures = padTextures;
  return settings;
}

std::unique_ptr<vtpl::host::EffectHost> openHost(vtpl::host::HostSettings settings,
                                                 std::ostream* trace) {
  auto host =
      std::make_unique<vtpl::host::EffectHost>(waveformModule(), std::move(settings), trace);
  host->open();
  return host;
}

vtpl::host::Image greyPicture(int width, int height, float level) {
  vtpl::host::Image picture;
  picture.width = width;
  picture.height = height;
  picture.rgba.assign(4 * static_cast<size_t>(width) * height, level);
  for (size_t i = 3; i < picture.rgba.size(); i += 4) {
    picture.rgba[i] = 1.0f;
  }
  return picture;
}

}  // namespace waveform_test
