// The set-up message (kMessageSetUp): loads the GL entry points and builds the instance's programs,
// with the host's context current.
#ifndef WAVEFORM_PLUGIN_SET_UP_H
#define WAVEFORM_PLUGIN_SET_UP_H

#include "host_access/host_calls.h"

namespace plugin::Scopes {

class ScopesEffectData;

void setUp(const Plugin::host::HostCalls& host, ScopesEffectData& instance);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_SET_UP_H
