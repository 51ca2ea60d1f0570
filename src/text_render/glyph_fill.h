// The fill draw of a glyph: its triangulated pieces drawn with the bound program.
#ifndef WAVEFORM_TEXT_RENDER_GLYPH_FILL_H
#define WAVEFORM_TEXT_RENDER_GLYPH_FILL_H

#include "geometry/character_outline.h"
#include "host_access/host_calls.h"

namespace Plugin::gl {

// Draws the outline's triangles with the bound program through the host's vertex array and two
// host buffers, handed back on every path; an outline with fewer than 3 indices draws nothing.
void drawFill(const qvtl::geometry::CharacterOutline& outline, const host::HostCalls& host);

}  // namespace Plugin::gl

#endif  // WAVEFORM_TEXT_RENDER_GLYPH_FILL_H
