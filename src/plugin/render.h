// The render message (kMessageRender): renders one frame of the effect into the host's output
// texture.
#ifndef WAVEFORM_PLUGIN_RENDER_H
#define WAVEFORM_PLUGIN_RENDER_H

#include <cstdint>

#include "host_access/host_calls.h"

namespace plugin::Scopes {

class ScopesEffectData;

// Copies the layer to the output and leaves the GL state as the host expects it. A host that
// asks to stop still gets its output. Answers 2 without a render record or its textures.
int32_t render(const Plugin::host::HostCalls& host, ScopesEffectData& instance);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_RENDER_H
