// The filled area of a glyph as indexed triangles, computed once and cached in its outline, and
// the fill draw of that cache.
#ifndef WAVEFORM_GEOMETRY_TRIANGULATE_PIECES_H
#define WAVEFORM_GEOMETRY_TRIANGULATE_PIECES_H

#include "geometry/character_outline.h"

namespace Plugin::gl {
class HostCalls;
}

namespace qvtl::geometry {

// Fills the outline's triangulation cache on first use: every filled piece with its holes,
// vertices and indices concatenated (each triangle's indices reversed), one piece id per
// triangle.
void triangulatePieces(CharacterOutline& outline);

// Draws the cached triangles with the bound program through the host's vertex array and two
// host buffers; an outline with fewer than 3 indices draws nothing.
void drawFill(CharacterOutline& outline, const Plugin::gl::HostCalls& host);

}  // namespace qvtl::geometry

#endif  // WAVEFORM_GEOMETRY_TRIANGULATE_PIECES_H
