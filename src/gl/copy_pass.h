// The general-purpose "glCopy" and "glClear" programs, and the pass that copies one host texture
// into another through the bound framebuffer.
#ifndef WAVEFORM_GL_COPY_PASS_H
#define WAVEFORM_GL_COPY_PASS_H

#include "gl/effect_data.h"
#include "host_access/host_calls.h"
#include "vtpl/host_interface.h"

namespace Plugin::gl {

inline constexpr char kCopyProgram[] = "glCopy";
inline constexpr char kClearProgram[] = "glClear";

// Builds whichever of the two programs the registry lacks; a failure throws QvGLSLexception.
void ensureCopyAndClearPrograms(EffectData& programs, bool echo);

// Draws `source` over the render record's frame into `target`, then leaves the render record's
// destination attached and its source bound on unit 0 for the next stage. Does nothing without
// "glCopy" or without a render record.
void copyPass(const host::HostCalls& host, EffectData& programs, const vtpl::HostTexture& source,
              const vtpl::HostTexture& target);

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_COPY_PASS_H
