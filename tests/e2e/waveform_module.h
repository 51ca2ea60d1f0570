// The Waveform module under test, loaded once for the whole test program, and helpers to open a
// reference host on it.
#ifndef WAVEFORM_TESTS_E2E_WAVEFORM_MODULE_H
#define WAVEFORM_TESTS_E2E_WAVEFORM_MODULE_H

#include <memory>
#include <ostream>

#include "effect_host.h"
#include "plugin_module.h"

namespace waveform_test {

const vtpl::host::PluginModule& waveformModule();

// Host settings without the initial announcements, so that tests start from the declared state.
vtpl::host::HostSettings declaredStateSettings();
// The same with the host's GL threads, so that frames can be rendered and the control drawn.
vtpl::host::HostSettings glSettings(bool padTextures = false);

// A host on the Waveform module after messages 3, 0 and 2.
std::unique_ptr<vtpl::host::EffectHost> openHost(
    vtpl::host::HostSettings settings = declaredStateSettings(), std::ostream* trace = nullptr);

// An opaque grey picture, mid-grey unless another level is given.
vtpl::host::Image greyPicture(int width, int height, float level = 0.5f);

}  // namespace waveform_test

#endif  // WAVEFORM_TESTS_E2E_WAVEFORM_MODULE_H
