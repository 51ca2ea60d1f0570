#include "plugin/render.h"

#include "gl/copy_pass.h"
#include "gl/host_textures.h"
#include "plugin/scopes_effect_data.h"

namespace plugin::Scopes {
namespace {

constexpr int32_t kProgressTotal = 100;

}  // namespace

int32_t render(const Plugin::gl::HostCalls& host, ScopesEffectData& instance) {
  const auto* frame = static_cast<const vtpl::HostRenderRecord*>(host.record().messageRecord);
  if (frame == nullptr || frame->source == nullptr || frame->destination == nullptr) {
    return vtpl::kResultNotHandled;
  }
  // A stop asked for here ends the analysis; the layer is still copied to the output.
  host.call(&vtpl::HostEffectRecord::progress, 0, kProgressTotal);

  Plugin::gl::copyPass(host, instance, *frame->source, *frame->destination);
  host.call(&vtpl::HostEffectRecord::progress, 90, kProgressTotal);

  // The host expects its output attached, nothing bound on unit 0 and no program in use.
  Plugin::gl::attachTexture(*frame->destination, 0, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D);
  Plugin::gl::unbindTextureUnit(GL_TEXTURE0, GL_TEXTURE_2D, false);
  instance.releaseProgram();
  return vtpl::kResultHandled;
}

}  // namespace plugin::Scopes
