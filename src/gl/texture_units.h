// Attaching host textures to the bound framebuffer and binding textures to texture units, with
// the sampling state the passes expect.
#ifndef WAVEFORM_GL_TEXTURE_UNITS_H
#define WAVEFORM_GL_TEXTURE_UNITS_H

#include "gl/gl_api.h"
#include "vtpl/host_interface.h"

namespace Plugin::gl {

// Attaches the texture to the bound framebuffer and sets the viewport to the level's size.
void attachTexture(const vtpl::HostTexture& texture, GLuint level, GLenum attachment,
                   GLenum target);
void bindTextureUnit(GLenum unit, GLenum target, GLuint name, bool linear);
void resetTextureUnit(GLenum unit, GLenum target, bool nearest);
void unbindTextureUnit(GLenum unit, GLenum target, bool nearest);

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_TEXTURE_UNITS_H
