#include <gmock/gmock.h>

#include <cstdlib>
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
  auto mesh = UnitQuad();
  Vexel::Object quad(*mesh);
  quad.setMaterial(0, &material);
  quad.setScale(8, 8, 1);
  quad.setPosition(0, 0, kDepth);
  quad.setParent(scene_->getRootNode());
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

TEST_F(KitErrors, MissingAndUnreadableFontsSayWhatWasLookedFor) {
  EXPECT_EQ(FailureOf([] { Font("/nonexistent/Missing.ttf", Font::FILE_TYPE_PATH, true); }),
            "Vexel: font \"/nonexistent/Missing.ttf\" not found: cannot open "
            "/nonexistent/Missing.ttf");
  EXPECT_EQ(FailureOf([] { Font("NoSuchFont.ttf", Font::FILE_TYPE_SYSTEM, true); }),
            "Vexel: platform font \"NoSuchFont.ttf\" not found in /usr/share/fonts and "
            "/usr/local/share/fonts");
  EXPECT_EQ(FailureOf([] { Font("NotoSansCJK-Regular.ttc", Font::FILE_TYPE_ASSET, true); }),
            "Vexel: font \"NotoSansCJK-Regular.ttc\" is an asset, but the current kit has no "
            "asset manager");

  const std::filesystem::path junk = std::filesystem::temp_directory_path() / "vexel-junk.ttf";
  std::ofstream(junk) << "not a font at all";
  EXPECT_THAT(FailureOf([&] { Font(junk.string(), Font::FILE_TYPE_PATH, true); }),
              HasSubstr("is not a readable font file"));
  std::filesystem::remove(junk);
}

TEST(KitFonts, AssetFontsAreReadThroughTheCurrentKitsAssetManager) {
  const std::filesystem::path dir = std::filesystem::temp_directory_path() / "vexel-assets";
  std::filesystem::create_directories(dir);
  std::filesystem::copy_file("/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf", dir / "Bundled.ttf",
                             std::filesystem::copy_options::overwrite_existing);
  AAssetManager* assets = platform::desktop::CreateDirectoryAssetManager(dir.string());
  {
    EXPECT_THAT(FailureOf([] { Font("Bundled.ttf", Font::FILE_TYPE_ASSET, true); }),
                HasSubstr("needs a live Vexel::Kit"));
    Vexel::Kit kit(assets, "");
    Font font("Bundled.ttf", Font::FILE_TYPE_ASSET, true);
    EXPECT_EQ(font.getName(), "Bundled.ttf");
    EXPECT_EQ(font.getFileType(), Font::FILE_TYPE_ASSET);
    EXPECT_EQ(font.getReferenceCharacter(), 0u);
    Vexel::Text text;
    text.setFont(font);
    text.setText("Asset");
    EXPECT_GT(text.getBoundingBox().width(), 2.0f);
    EXPECT_EQ(FailureOf([] { Font("Absent.ttf", Font::FILE_TYPE_ASSET, true); }),
              "Vexel: font asset \"Absent.ttf\" not found");
    EXPECT_EQ(FailureOf([] { Font("../Bundled.ttf", Font::FILE_TYPE_ASSET, true); }),
              "Vexel: font asset \"../Bundled.ttf\" not found");
  }
  platform::desktop::DestroyDirectoryAssetManager(assets);
  std::filesystem::remove_all(dir);
}

TEST_F(KitErrors, InconsistentMeshDefinitionsAreRejected) {
  Vexel::Mesh mesh("Bad");
  EXPECT_EQ(FailureOf([&] { mesh.end(); }), "Vexel: mesh \"Bad\": end() without begin()");
  mesh.begin(3, 3, Vexel::Mesh::RENDER_TRIANGLES);
  mesh.position(0, 0, 0);
  mesh.position(1, 0, 0);
  EXPECT_EQ(FailureOf([&] { mesh.end(); }), "Vexel: mesh \"Bad\": 2 positions for 3 vertices");
  EXPECT_EQ(FailureOf([&] { mesh.finalize(); }),
            "Vexel: mesh \"Bad\": finalize() before a complete definition");

  mesh.begin(3, 3, Vexel::Mesh::RENDER_TRIANGLES);
  for (int i = 0; i < 3; ++i)
    mesh.position(static_cast<float>(i), 0, 0);
  mesh.textureCoord(0, 0);
  mesh.index(0);
  mesh.index(1);
  mesh.index(2);
  EXPECT_EQ(FailureOf([&] { mesh.end(); }),
            "Vexel: mesh \"Bad\": 1 texture coordinates for 3 vertices");

  mesh.begin(3, 3, Vexel::Mesh::RENDER_TRIANGLES);
  for (int i = 0; i < 3; ++i)
    mesh.position(static_cast<float>(i), 0, 0);
  mesh.index(0);
  mesh.index(1);
  mesh.index(3);
  EXPECT_EQ(FailureOf([&] { mesh.end(); }), "Vexel: mesh \"Bad\": index 3 names no vertex");
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
