// The draw-control message (kMessageDrawControl): the host's interface thread asks for the scope
// control to be drawn.
#ifndef WAVEFORM_PLUGIN_DRAW_CONTROL_H
#define WAVEFORM_PLUGIN_DRAW_CONTROL_H

#include <cstdint>

#include "host_access/host_calls.h"

namespace plugin::Scopes {

class ScopesEffectData;

// Analyses the frame on this thread when the published results are stale (or a fresh drawing is
// forced) and the frame was not analysed yet, and publishes the results. Answers 1.
int32_t drawControl(const Plugin::host::HostCalls& host, ScopesEffectData& instance);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_DRAW_CONTROL_H
