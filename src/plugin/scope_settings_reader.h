// Reading the effect's parameters from the host: single values, and the plain settings the
// scope passes take, read once per message.
#ifndef WAVEFORM_PLUGIN_SCOPE_SETTINGS_READER_H
#define WAVEFORM_PLUGIN_SCOPE_SETTINGS_READER_H

#include <cstdint>

#include "host_access/host_calls.h"
#include "scope/scope_settings.h"

namespace plugin::Scopes {

// One parameter's value at `time`.
bool readBool(const Plugin::host::HostCalls& host, const char* id, int32_t time);
int32_t readInt(const Plugin::host::HostCalls& host, const char* id, int32_t time);

// "showComparison" at `time`, and the comparison type, which the scope reads at time 0.
ComparisonSettings readComparisonSettings(const Plugin::host::HostCalls& host, int32_t time);

AnalysisSettings readAnalysisSettings(const Plugin::host::HostCalls& host, int32_t time);

// The picture's layout choices, read at time 0 whatever frame is shown.
CompositionSettings readCompositionSettings(const Plugin::host::HostCalls& host);

int32_t readBlendType(const Plugin::host::HostCalls& host, int32_t time);
RenderToLayerSettings readRenderToLayerSettings(const Plugin::host::HostCalls& host, int32_t time);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_SCOPE_SETTINGS_READER_H
