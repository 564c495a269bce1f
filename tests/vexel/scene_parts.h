#pragma once

// The pieces of the overlay scene that the kit's tests and benchmark both
// build: the renderer's two shader pairs, its unit quad and the materials
// made from them. Free of any test framework so the benchmark can use it.

#include <memory>

#include "vexel/Vexel.h"

namespace vexel_test {

// A plain textured quad, and the inpainted patch with colour correction and
// faded edges.
inline constexpr const char* kQuadVertex =
    "#version 100\n attribute vec4 position; attribute vec2 uv0; uniform mat4 worldViewProj; "
    "varying vec2 oUv0; void main() { gl_Position = worldViewProj * position; oUv0 = uv0; }";
inline constexpr const char* kQuadFragment =
    "#version 100\n precision mediump int; precision mediump float; uniform sampler2D "
    "diffuseMap; varying vec2 oUv0; void main() { gl_FragColor = texture2D(diffuseMap, oUv0); }";
inline constexpr const char* kPatchVertex =
    "#version 100\n attribute vec4 vertex; attribute vec2 uv0; uniform mat4 worldViewProj; "
    "varying vec2 uv; void main(void) { uv = uv0; gl_Position = worldViewProj * vertex; }";
inline constexpr const char* kPatchFragment =
    "#version 100\n precision mediump float; precision mediump int; varying vec2 uv; uniform "
    "sampler2D texture0; uniform vec3 colorScale; uniform vec3 colorShift; void main(void) { vec4 "
    "col = texture2D(texture0, uv); gl_FragColor = vec4(col.rgb * colorScale + "
    "vec3(colorShift/255.0), col.a); vec2 uvCentered = abs((uv * vec2(2.0, 2.0)) - vec2(1.0, "
    "1.0)); float maxUVDist = max(uvCentered.x * uvCentered.x * uvCentered.x, uvCentered.y * "
    "uvCentered.y); const float minAlpha = 0.8; gl_FragColor *= vec4(1, 1, 1, (1.0 - maxUVDist) "
    "+ minAlpha); }";

// The unit quad centred on its node, v running down so that the first image
// row is at the top.
inline std::unique_ptr<Vexel::Mesh> UnitQuad(const char* name = "UnitQuad") {
  auto mesh = std::make_unique<Vexel::Mesh>(name);
  mesh->begin(4, 4, Vexel::Mesh::RENDER_TRIANGLE_STRIP);
  const float corners[4][4] = {
      {0.5f, -0.5f, 1, 1}, {0.5f, 0.5f, 1, 0}, {-0.5f, -0.5f, 0, 1}, {-0.5f, 0.5f, 0, 0}};
  for (const auto& c : corners) {
    mesh->position(c[0], c[1], 0);
    mesh->textureCoord(c[2], c[3]);
  }
  for (unsigned int i = 0; i < 4; ++i)
    mesh->index(i);
  mesh->end();
  mesh->finalize();
  return mesh;
}

inline std::unique_ptr<Vexel::Material> QuadMaterial(Vexel::ResourceManager& resources,
                                                     Vexel::Texture* texture) {
  using Vexel::Material;
  auto material = std::make_unique<Material>(resources);
  material->setShader(Material::SHADER_VERTEX, "QuadVertex", kQuadVertex);
  material->setShader(Material::SHADER_FRAGMENT, "QuadFragment", kQuadFragment);
  material->setShaderSampler(Material::SHADER_FRAGMENT, "diffuseMap", texture);
  material->setShaderAutoUniform(Material::SHADER_VERTEX, "worldViewProj",
                                 Material::AUTO_UNIFORM_WORLD_VIEW_PROJECTION_MATRIX);
  return material;
}

// Each colour channel becomes channel * scale + shift / 255; blending is left
// to the caller.
inline std::unique_ptr<Vexel::Material> PatchMaterial(Vexel::ResourceManager& resources,
                                                      Vexel::Texture* texture,
                                                      const Vexel::Vector3& scale,
                                                      const Vexel::Vector3& shift) {
  using Vexel::Material;
  auto material = std::make_unique<Material>(resources);
  material->setShader(Material::SHADER_VERTEX, "PatchVertex", kPatchVertex);
  material->setShader(Material::SHADER_FRAGMENT, "PatchFragment", kPatchFragment);
  material->setShaderSampler(Material::SHADER_FRAGMENT, "texture0", texture);
  material->setShaderAutoUniform(Material::SHADER_VERTEX, "worldViewProj",
                                 Material::AUTO_UNIFORM_WORLD_VIEW_PROJECTION_MATRIX);
  material->setShaderUniform(Material::SHADER_FRAGMENT, "colorScale", scale);
  material->setShaderUniform(Material::SHADER_FRAGMENT, "colorShift", shift);
  return material;
}

}  // namespace vexel_test
