// The GLSL sources of the analysis programs "Waveform" and "WaveformUI": a point per sampled
// pixel, placed by its position and signal value, coloured by hue or by intensity.
#ifndef WAVEFORM_SCOPE_WAVEFORM_ANALYSIS_SHADERS_H
#define WAVEFORM_SCOPE_WAVEFORM_ANALYSIS_SHADERS_H

namespace plugin::Scopes::AnalysisShader {

// Attribute 0 of the point program: one signed byte per grid row.
inline constexpr char kRowAttribute[] = "rowOffset";

inline constexpr char kLayerSampler[] = "layerTexture";
inline constexpr char kFrameSize[] = "frameSize";
inline constexpr char kLayerExtent[] = "layerExtent";
inline constexpr char kDirection[] = "direction";
inline constexpr char kGridOrigin[] = "gridOrigin";
inline constexpr char kSamplingScale[] = "samplingScale";
inline constexpr char kIntensity[] = "intensity";
inline constexpr char kValueRange[] = "valueRange";
inline constexpr char kColorSpace[] = "colorSpace";
inline constexpr char kLinearInput[] = "linearInput";
inline constexpr char kChannelIndex[] = "channelIndex";

// "@COLOUR_SPACE_ROWS@" stands for lumaWeights(), cbWeights() and crWeights(), generated from
// the colour-space table so that the coefficients are defined once.
inline constexpr char kVertexSourceTemplate[] = R"(#version 410
in float rowOffset;
uniform mat4 projectionMatrix;
uniform mat4 modelViewMatrix;
uniform sampler2D layerTexture;
uniform vec2 frameSize;
uniform vec2 layerExtent;
uniform float direction;
uniform ivec2 gridOrigin;
uniform vec2 samplingScale;
uniform float intensity;
uniform vec2 valueRange;
uniform int colorSpace;
uniform int linearInput;
uniform int channelIndex;
out vec4 pointColour;

vec3 toHsv(vec3 c) {
  vec4 k = vec4(0.0, -1.0 / 3.0, 2.0 / 3.0, -1.0);
  vec4 p = mix(vec4(c.bg, k.wz), vec4(c.gb, k.xy), step(c.b, c.g));
  vec4 q = mix(vec4(p.xyw, c.r), vec4(c.r, p.yzx), step(p.x, c.r));
  float d = q.x - min(q.w, q.y);
  float e = 1.0e-10;
  return vec3(abs(q.z + (q.w - q.y) / (6.0 * d + e)), d / (q.x + e), q.x);
}

vec3 toRgb(vec3 c) {
  vec4 k = vec4(1.0, 2.0 / 3.0, 1.0 / 3.0, 3.0);
  vec3 p = abs(fract(c.xxx + k.xyz) * 6.0 - k.www);
  return c.z * mix(k.xxx, clamp(p - k.xxx, 0.0, 1.0), c.y);
}

float encodeSrgb(float x) {
  return x <= 0.0031308 ? 12.92 * x : 1.055 * pow(x, 0.41666) - 0.055;
}

@COLOUR_SPACE_ROWS@
bool knownColorSpace() {
  return colorSpace == 601 || colorSpace == 709 || colorSpace == 2020;
}

float signalValue(vec4 s) {
  if (channelIndex == 0 || channelIndex == 5) return dot(lumaWeights(), s.rgb);
  if (channelIndex == 1) return s.r;
  if (channelIndex == 2) return s.g;
  if (channelIndex == 3) return s.b;
  if (channelIndex == 4) return s.a;
  if (channelIndex == 6) return knownColorSpace() ? dot(cbWeights(), s.rgb) + 0.5 : 0.0;
  if (channelIndex == 7) return knownColorSpace() ? dot(crWeights(), s.rgb) + 0.5 : 0.0;
  return 0.0;
}

void main() {
  vec2 cell = vec2(float(gl_InstanceID), float(gl_VertexID));
  vec2 p = (cell + vec2(gridOrigin) + 0.5) / samplingScale;
  vec4 s = textureLod(layerTexture, p / frameSize * layerExtent, 0.0);
  if (linearInput != 0) {
    vec3 straight = s.a > 0.0 ? s.rgb / s.a : s.rgb;
    straight = vec3(encodeSrgb(straight.r), encodeSrgb(straight.g), encodeSrgb(straight.b));
    s.rgb = straight * s.a;
  }
  float v = 0.0;
  pointColour = vec4(0.0);
  if (s.a > 0.0) {
    v = signalValue(s);
    if (channelIndex == 0) {
      float m = max(s.r, max(s.g, s.b));
      float n = min(s.r, min(s.g, s.b));
      vec3 lifted = s.rgb + max(-0.5 * (m + n), 0.0);
      vec3 hsv = toHsv(lifted);
      pointColour = vec4(toRgb(vec3(hsv.xy, 1.0)) * intensity, 1.0);
    } else {
      pointColour = vec4(vec3(intensity), 1.0);
    }
  }
  v = (v - valueRange.x) / (valueRange.y - valueRange.x);

  vec2 axis = vec2(cos(direction), -sin(direction));
  vec2 centre = frameSize * 0.5;
  float h = dot(axis, p - centre);
  float y = (clamp(v, 0.0, 1.0) - 0.5) * (frameSize.y - 1.0);
  float stretch = mix(frameSize.x / frameSize.y, 1.0, abs(cos(direction)));
  vec2 position = vec2(h * stretch, y) + centre;
  gl_Position = projectionMatrix * modelViewMatrix * vec4(position, rowOffset * 1e-8, 1.0);
}
)";

inline constexpr char kFragmentSource[] = R"(#version 410
in vec4 pointColour;
layout(location = 0) out vec4 fragColour;
void main() {
  if (pointColour.a <= 0.0) {
    discard;
  }
  fragColour = pointColour;
}
)";

}  // namespace plugin::Scopes::AnalysisShader

#endif  // WAVEFORM_SCOPE_WAVEFORM_ANALYSIS_SHADERS_H
