// Reading the effect's parameters from the host into the plain settings the scope passes take,
// once per message.
#ifndef WAVEFORM_PLUGIN_SCOPE_SETTINGS_READER_H
#define WAVEFORM_PLUGIN_SCOPE_SETTINGS_READER_H

#include <cstdint>

#include "host_access/host_calls.h"
#include "scope/scope_settings.h"

namespace plugin::Scopes {

// "showComparison" at `time`, and the comparison type, which the scope reads at time 0.
ComparisonSettings readComparisonSettings(const Plugin::host::HostCalls& host, int32_t time);

AnalysisSettings readAnalysisSettings(const Plugin::host::HostCalls& host, int32_t time);

// The picture's layout choices, read at time 0 whatever frame is shown.
CompositionSettings readCompositionSettings(const Plugin::host::HostCalls& host);

int32_t readBlendType(const Plugin::host::HostCalls& host, int32_t time);
RenderToLayerSettings readRenderToLayerSettings(const Plugin::host::HostCalls& host, int32_t time);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_SCOPE_SETTINGS_READER_H
