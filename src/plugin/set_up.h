// Message 8: prepares an instance for drawing once the host's GL context is current.
#ifndef WAVEFORM_PLUGIN_SET_UP_H
#define WAVEFORM_PLUGIN_SET_UP_H

#include "gl/host_calls.h"

namespace plugin::Scopes {

class ScopesEffectData;

void setUp(const Plugin::gl::HostCalls& host, ScopesEffectData& instance);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_SET_UP_H
