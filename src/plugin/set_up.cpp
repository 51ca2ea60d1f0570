#include "plugin/set_up.h"

#include <cstdio>

#include "plugin/scopes_effect_data.h"

namespace plugin::Scopes {

void setUp(const Plugin::gl::HostCalls& host, ScopesEffectData& instance) {
  if (host.record().verbose != 0) {
    std::fputs("Waveform Plugin\n", stdout);
    std::fflush(stdout);
  }
  instance.instancedDrawing = true;
}

}  // namespace plugin::Scopes
