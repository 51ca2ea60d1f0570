#include "gl/copy_pass.h"

#include <string>

#include "gl/pass_state_guard.h"
#include "gl/quad_maths.h"
#include "gl/texture_units.h"
#include "gl/textured_quad_program.h"
#include "gl/vertex_attributes.h"
#include "gl/vertex_buffer.h"

namespace Plugin::gl {
namespace {

const std::string kCopyFragmentSource = std::string(R"(#version 410
uniform sampler2D sourceTexture;
in vec2 texCoord;
layout(location = 0) out vec4 fragColour;
)") + kTexelCentreSamplingSource + R"(
void main() {
  fragColour = sampleAtTexelCentres(sourceTexture, texCoord);
}
)";

const std::string kClearVertexSource = R"(#version 410
in vec4 vertexPosition;
in vec2 vertexTexCoord;
uniform mat4 projectionMatrix;
uniform mat4 modelViewMatrix;
void main() {
  gl_Position = projectionMatrix * modelViewMatrix * vertexPosition;
}
)";

const std::string kClearFragmentSource = R"(#version 410
uniform vec4 clearColour;
layout(location = 0) out vec4 fragColour;
void main() {
  fragColour = clearColour;
}
)";

}  // namespace

void ensureCopyAndClearPrograms(EffectData& programs, bool echo) {
  programs.ensureProgram(kClearProgram, {kClearVertexSource, {}, kClearFragmentSource},
                         {echo, AttributeNames::kStored, TexCoords::kNone});
  programs.ensureProgram(kCopyProgram, {kTexturedQuadVertexSource, {}, kCopyFragmentSource},
                         {echo, AttributeNames::kStored, TexCoords::kOne});
}

void copyPass(const host::HostCalls& host, EffectData& programs, const vtpl::HostTexture& source,
              const vtpl::HostTexture& target) {
  const auto* render = static_cast<const vtpl::HostRenderRecord*>(host.record().messageRecord);
  if (programs.programId(kCopyProgram) < 0 || render == nullptr) {
    return;
  }
  const PassStateGuard stateGuard;
  programs.useProgram(kCopyProgram);
  attachTexture(target, 0, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D);
  programs.setUniformMatrix(programs.uniformLocation(kProjectionUniform), 4, 1, false,
                            render->projection);
  programs.setUniformMatrix(programs.uniformLocation(kModelViewUniform), 4, 1, false,
                            render->modelView);

  // The quad spans the frame; its texture coordinates are the used area of the source.
  const QuadVertices quad = textureQuad(source, static_cast<GLuint>(render->frameWidth),
                                        static_cast<GLuint>(render->frameHeight));
  bindTextureUnit(GL_TEXTURE0, GL_TEXTURE_2D, source.name, true);
  drawQuadArrays(host, quad.data(), 4, GL_TRIANGLE_STRIP);

  // Leave the frame's own textures in place for the stage that follows.
  if (render->destination != nullptr) {
    attachTexture(*render->destination, 0, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D);
  }
  if (render->source != nullptr) {
    bindTextureUnit(GL_TEXTURE0, GL_TEXTURE_2D, render->source->name, false);
    resetTextureUnit(GL_TEXTURE0, GL_TEXTURE_2D, true);
  }
  programs.releaseProgram();
}

}  // namespace Plugin::gl
