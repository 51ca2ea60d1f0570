// How the effect keeps the host's parameter panel tidy when values change: it shows and hides
// dependent parameters and keeps the colour space in step with the layer (parameter changed and
// parameter edited messages).
#ifndef WAVEFORM_PLUGIN_PARAMETER_REACTIONS_H
#define WAVEFORM_PLUGIN_PARAMETER_REACTIONS_H

#include <cstdint>

#include "host_access/host_calls.h"

namespace plugin::Scopes {

// The name the host reports when the layer the effect sits on changes; not a declared parameter.
inline constexpr char kEffectParentLayer[] = "Effect_Parent_Layer";

// The colour space a layer of this height is most likely graded in.
int32_t colorSpaceForLayerHeight(int32_t height);

// A parameter changed (kMessageParameterChanged). `changedId` may be null (the host named nothing),
// which changes nothing.
void parameterChanged(const Plugin::host::HostCalls& host, const char* changedId);

// A parameter edited by the user (kMessageParameterEdited and its alternative): a colour space
// picked by hand stops following the layer.
void parameterEdited(const Plugin::host::HostCalls& host, const char* changedId);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_PARAMETER_REACTIONS_H
