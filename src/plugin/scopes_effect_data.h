// The state of one effect instance: its GL programs (through the EffectData base), the pool of
// stencil buffers, the label style and the cache of rendered labels.
#ifndef WAVEFORM_PLUGIN_SCOPES_EFFECT_DATA_H
#define WAVEFORM_PLUGIN_SCOPES_EFFECT_DATA_H

#include <mutex>

#include "gl/effect_data.h"
#include "gl/resource_types.h"
#include "scope/label_text_settings.h"

namespace plugin::Scopes {

// Members are destroyed in reverse order: label cache, text settings, lock, stencil pool, then
// the EffectData base with its programs.
class ScopesEffectData : public Plugin::gl::EffectData {
 public:
  bool instancedDrawing = false;  // set once GL is set up: one instanced draw per analysis pass
  Plugin::gl::StencilBufferList stencilPool;
  // Guards the stencil pool, texture creation and the label cache; both host threads use them.
  std::recursive_mutex resourceLock;
  LabelTextSettings labelTextSettings;
  LabelCache labelCache;
};

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_SCOPES_EFFECT_DATA_H
