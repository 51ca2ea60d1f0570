// The filled area of a glyph as indexed triangles, computed once when its outline is built.
#ifndef WAVEFORM_GEOMETRY_TRIANGULATE_PIECES_H
#define WAVEFORM_GEOMETRY_TRIANGULATE_PIECES_H

#include "geometry/character_outline.h"

namespace qvtl::geometry {

// Fills the outline's triangles once: every filled piece with its holes, vertices and indices
// concatenated (each triangle's indices reversed), one piece id per triangle. The outline is
// built with them, before anything can share it.
void triangulatePieces(CharacterOutline& outline);

}  // namespace qvtl::geometry

#endif  // WAVEFORM_GEOMETRY_TRIANGULATE_PIECES_H
