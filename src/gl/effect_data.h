// Base of every effect instance's data. It will hold the instance's registry of named GLSL
// programs; for now it gives the instance its virtual destructor, through which the dispatcher
// destroys whatever instance the host record holds.
#ifndef WAVEFORM_GL_EFFECT_DATA_H
#define WAVEFORM_GL_EFFECT_DATA_H

namespace Plugin::gl {

class EffectData {
 public:
  EffectData() = default;
  EffectData(const EffectData&) = delete;
  EffectData& operator=(const EffectData&) = delete;
  virtual ~EffectData() = default;
};

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_EFFECT_DATA_H
