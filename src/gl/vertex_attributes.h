// Vertex attribute locations, fixed for every program of the system, and the names programs
// declare them under: the plain names, or the names the stored sources use.
#ifndef WAVEFORM_GL_VERTEX_ATTRIBUTES_H
#define WAVEFORM_GL_VERTEX_ATTRIBUTES_H

namespace Plugin::gl {

inline constexpr unsigned kPositionLocation = 0;
inline constexpr unsigned kTexCoordLocation = 8;
inline constexpr unsigned kSecondTexCoordLocation = 9;

inline constexpr char kPlainPositionName[] = "in_Position";
inline constexpr char kPlainTexCoordName[] = "in_TexCoord";
inline constexpr char kPlainFirstTexCoordName[] = "in_TexCoord0";
inline constexpr char kPlainSecondTexCoordName[] = "in_TexCoord1";

// The names under which the system's own GLSL sources declare their attributes.
inline constexpr char kStoredPositionName[] = "vertexPosition";
inline constexpr char kStoredTexCoordName[] = "vertexTexCoord";
inline constexpr char kStoredSecondTexCoordName[] = "vertexTexCoord1";

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_VERTEX_ATTRIBUTES_H
