#include "plugin/set_up.h"

#include <cstdio>

#include "gl/copy_pass.h"
#include "gl/glew_setup.h"
#include "host_access/plugin_exception.h"
#include "plugin/scopes_effect_data.h"
#include "scope/blend_shader.h"
#include "scope/graticule_drawing.h"
#include "scope/waveform_analysis.h"
#include "scope/waveform_display.h"

namespace plugin::Scopes {

void setUp(const Plugin::host::HostCalls& host, ScopesEffectData& instance) {
  // Without a current context GLEW loads nothing, and every later GL call would jump through a
  // null entry point: refuse instead.
  if (!Plugin::gl::initialiseGlew()) {
    throw Plugin::host::PluginException(Plugin::host::kPluginErrorText);
  }
  const bool verbose = host.record().verbose != 0;
  if (verbose) {
    std::fputs("Waveform Plugin\n", stdout);
    std::fflush(stdout);
  }
  instance.instancedDrawing = true;
  ensureAnalysisPrograms(instance, verbose);
  ensureGuidelineProgram(instance, verbose);
  ensureWaveformDisplayPrograms(instance, verbose);
  ensureBlendProgram(instance, verbose);
  Plugin::gl::ensureCopyAndClearPrograms(instance, verbose);
}

}  // namespace plugin::Scopes
