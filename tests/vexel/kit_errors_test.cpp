#include <gmock/gmock.h>

#include <filesystem>
#include <fstream>

#include "headless_scene.h"

namespace vexel_test {
namespace {

using ::testing::HasSubstr;
using ::testing::StartsWith;
using Vexel::Font;
using Vexel::Material;

// The message of the Vexel::Exception that `action` throws; fails the test
// when it throws nothing.
template <class Action>
std::string FailureOf(Action action) {
  try {
    action();
  } catch (const Vexel::Exception& error) {
    return error.what();
  }
  ADD_FAILURE() << "no Vexel::Exception";
  return {};
}

class KitErrors : public HeadlessScene {};

TEST_F(KitErrors, ShaderThatDoesNotCompileNamesItselfAndCarriesTheInfoLog) {
  Material material(kit_->getResourceManager());
  material.setShader(Material::SHADER_VERTEX, "QuadVertex", kQuadVertex);
  const std::string message = FailureOf([&] {
    material.setShader(Material::SHADER_FRAGMENT, "BrokenFragment",
                       "#version 100\n precision mediump float; void main() { gl_FragColor = "
                       "undeclaredColour; }");
  });
  EXPECT_THAT(message, StartsWith("Vexel: fragment shader \"BrokenFragment\" failed to compile: "));
  EXPECT_THAT(message, HasSubstr("undeclaredColour"));  // the compiler's own words

  // The material stays usable: a good fragment shader still links.
  auto texture = SolidTexture({0, 255, 255, 255});
  material.setShader(Material::SHADER_FRAGMENT, "QuadFragment", kQuadFragment);
  material.setShaderSampler(Material::SHADER_FRAGMENT, "diffuseMap", texture.get());
  material.setShaderAutoUniform(Material::SHADER_VERTEX, "worldViewProj",
                                Material::AUTO_UNIFORM_WORLD_VIEW_PROJECTION_MATRIX);
  auto quad = AddQuad(&material, 8, 8);
  EXPECT_PIXEL(Draw(), 32, 24, {0, 255, 255, 255});
}

TEST_F(KitErrors, ShadersThatDoNotLinkNameBothStages) {
  Material material(kit_->getResourceManager());
  material.setShader(Material::SHADER_FRAGMENT, "NeedsVarying",
                     "#version 100\n precision mediump float; varying vec3 tint; void main() { "
                     "gl_FragColor = vec4(tint, 1.0); }");
  const std::string message = FailureOf([&] {
    material.setShader(Material::SHADER_VERTEX, "NoVarying",
                       "#version 100\n attribute vec4 position; void main() { gl_Position = "
                       "position; }");
  });
  EXPECT_THAT(message,
              StartsWith("Vexel: shaders \"NoVarying\" and \"NeedsVarying\" failed to link: "));
  EXPECT_THAT(message, HasSubstr("tint"));
}

TEST(KitFonts, FontsThatCannotBeLoadedSayWhatWasLookedFor) {
  const auto failure = [](const std::string& name, Font::FileType type) {
    return FailureOf([&] { Font(name, type, true); });
  };
  EXPECT_THAT(failure("Bundled.ttf", Font::FILE_TYPE_ASSET), HasSubstr("needs a live Vexel::Kit"));
  Vexel::Kit kit(nullptr, "");
  EXPECT_EQ(failure("/nonexistent/Missing.ttf", Font::FILE_TYPE_PATH),
            "Vexel: font \"/nonexistent/Missing.ttf\" not found: cannot open "
            "/nonexistent/Missing.ttf");
  EXPECT_EQ(failure("NoSuchFont.ttf", Font::FILE_TYPE_SYSTEM),
            "Vexel: platform font \"NoSuchFont.ttf\" not found in /usr/share/fonts and "
            "/usr/local/share/fonts");
  EXPECT_EQ(failure("NotoSansCJK-Regular.ttc", Font::FILE_TYPE_ASSET),
            "Vexel: font \"NotoSansCJK-Regular.ttc\" is an asset, but the current kit has no "
            "asset manager");

  const std::filesystem::path junk = std::filesystem::temp_directory_path() / "vexel-junk.ttf";
  std::ofstream(junk) << "not a font at all";
  EXPECT_THAT(failure(junk.string(), Font::FILE_TYPE_PATH),
              HasSubstr("is not a readable font file"));
  std::filesystem::remove(junk);
}

TEST_F(KitErrors, InconsistentMeshDefinitionsAreRejected) {
  Vexel::Mesh mesh("Bad");
  EXPECT_EQ(FailureOf([&] { mesh.end(); }), "Vexel: mesh \"Bad\": end() without begin()");
  const struct {
    int positions;
    int texture_coords;
    std::vector<unsigned int> indices;
    const char* message;
  } cases[] = {
      {2, 0, {}, "Vexel: mesh \"Bad\": 2 positions for 3 vertices"},
      {3, 1, {0, 1, 2}, "Vexel: mesh \"Bad\": 1 texture coordinates for 3 vertices"},
      {3, 0, {0, 1, 3}, "Vexel: mesh \"Bad\": index 3 names no vertex"},
  };
  for (const auto& c : cases) {
    mesh.begin(3, 3, Vexel::Mesh::RENDER_TRIANGLES);
    for (int i = 0; i < c.positions; ++i)
      mesh.position(static_cast<float>(i), 0, 0);
    for (int i = 0; i < c.texture_coords; ++i)
      mesh.textureCoord(0, 0);
    for (unsigned int index : c.indices)
      mesh.index(index);
    EXPECT_EQ(FailureOf([&] { mesh.end(); }), c.message);
    EXPECT_EQ(FailureOf([&] { mesh.finalize(); }),
              "Vexel: mesh \"Bad\": finalize() before a complete definition");
  }
}

TEST_F(KitErrors, BadArgumentsThrowInsteadOfCorruptingState) {
  EXPECT_THAT(FailureOf([&] {
                Vexel::AndroidSurfaceRenderer(*kit_, nullptr, Vexel::Renderer::ANTI_ALIASING_NONE);
              }),
              HasSubstr("needs a window"));

  Vexel::Texture texture(kit_->getResourceManager(), "Negative", Vexel::Texture::TYPE_2D, false);
  EXPECT_THAT(
      FailureOf([&] { texture.setImage(nullptr, -1, 4, Vexel::Texture::PIXEL_FORMAT_RGBA8); }),
      HasSubstr("is negative"));
  EXPECT_EQ(texture.getWidth(), 0);

  Vexel::EmptyNode parent;
  Vexel::EmptyNode child;
  child.setParent(&parent);
  EXPECT_THAT(FailureOf([&] { parent.setParent(&child); }), HasSubstr("cannot be attached"));
  EXPECT_THAT(FailureOf([&] { parent.setParent(&parent); }), HasSubstr("cannot be attached"));
  EXPECT_EQ(parent.getParent(), nullptr);
  EXPECT_EQ(child.getParent(), &parent);
}

}  // namespace
}  // namespace vexel_test
