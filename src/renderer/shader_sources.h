#pragma once

// GLSL ES 1.00 programs of the overlay scene. The texts are kept exactly as
// they are (spacing included): the kit compiles each pair once and shares it.
namespace ocr_ar::shaders {

// The camera image on the background quad.
inline constexpr const char* kBackgroundVertexName = "BackgroundImageVertShader";
inline constexpr const char* kBackgroundFragmentName = "BackgroundImageFragShader";
inline constexpr const char* kBackgroundVertexSource =
    "#version 100\n attribute vec4 position; attribute vec2 uv0; uniform mat4 worldViewProj; "
    "varying vec2 oUv0; void main() { gl_Position = worldViewProj * position; oUv0 = uv0; }";
inline constexpr const char* kBackgroundFragmentSource =
    "#version 100\n precision mediump int; precision mediump float; uniform sampler2D "
    "diffuseMap; varying vec2 oUv0; void main() { gl_FragColor = texture2D(diffuseMap, oUv0); }";

// An inpainted patch: colour-corrected to the live frame (scale, then a shift
// in 0..255 units) and faded towards its border, deliberately softer across
// the width (cube of the horizontal offset) than across the height (square).
inline constexpr const char* kInpaintedRectVertexName = "InpaintedRectVertexShader";
inline constexpr const char* kInpaintedRectFragmentName = "InpaintedRectFragmentShader";
inline constexpr const char* kInpaintedRectVertexSource =
    "#version 100\n attribute vec4 vertex; attribute vec2 uv0; uniform mat4 worldViewProj; "
    "varying vec2 uv; void main(void) { uv = uv0; gl_Position = worldViewProj * vertex; }";
inline constexpr const char* kInpaintedRectFragmentSource =
    "#version 100\n precision mediump float; precision mediump int; varying vec2 uv; uniform "
    "sampler2D texture0; uniform vec3 colorScale; uniform vec3 colorShift; void main(void) { "
    "vec4 col = texture2D(texture0, uv); gl_FragColor = vec4(col.rgb * colorScale + "
    "vec3(colorShift/255.0), col.a); vec2 uvCentered = abs((uv * vec2(2.0, 2.0)) - vec2(1.0, "
    "1.0)); float maxUVDist = max(uvCentered.x * uvCentered.x * uvCentered.x, uvCentered.y * "
    "uvCentered.y); const float minAlpha = 0.8; gl_FragColor *= vec4(1, 1, 1, (1.0 - "
    "maxUVDist) + minAlpha); }";

// Sampler and uniform names shared with the sources above.
inline constexpr const char* kBackgroundSampler = "diffuseMap";
inline constexpr const char* kPatchSampler = "texture0";
inline constexpr const char* kWorldViewProj = "worldViewProj";
inline constexpr const char* kColorScale = "colorScale";
inline constexpr const char* kColorShift = "colorShift";

}  // namespace ocr_ar::shaders
