// Natives of org.vexel.KitProbe, a Java test's way to drive the kit through
// the same calls a bridge makes on a phone: the Java surface and asset
// manager become native ones by their NDK functions.
#include <android/asset_manager_jni.h>
#include <android/native_window_jni.h>
#include <jni.h>

#include <string>

#include "vexel/Vexel.h"

namespace {

std::string ToString(JNIEnv* env, jstring text) {
  const char* chars = env->GetStringUTFChars(text, nullptr);
  std::string copy = chars != nullptr ? chars : "";
  if (chars != nullptr)
    env->ReleaseStringUTFChars(text, chars);
  return copy;
}

void ThrowJava(JNIEnv* env, const char* message) {
  env->ThrowNew(env->FindClass("java/lang/IllegalStateException"), message);
}

}  // namespace

// Draws one frame of an empty scene cleared to the colour (0xAABBGGRR) into
// the window behind the surface; false when the object is no surface.
extern "C" JNIEXPORT jboolean JNICALL Java_org_vexel_KitProbe_drawBackground(JNIEnv* env, jclass,
                                                                             jobject surface,
                                                                             jint rgba) {
  ANativeWindow* window = ANativeWindow_fromSurface(env, surface);
  if (window == nullptr)
    return JNI_FALSE;
  try {
    Vexel::Kit kit(nullptr, "");
    Vexel::AndroidSurfaceRenderer renderer(kit, window, Vexel::Renderer::ANTI_ALIASING_NONE);
    Vexel::Scene scene(kit);
    const auto channel = [&](int shift) {
      return static_cast<std::uint8_t>((rgba >> shift) & 0xFF);
    };
    scene.setBackgroundColor(
        Vexel::Color::fromBytes(channel(0), channel(8), channel(16), channel(24)));
    renderer.setScene(&scene);
    kit.drawAll();
  } catch (const std::exception& error) {
    ThrowJava(env, error.what());
  }
  ANativeWindow_release(window);
  return JNI_TRUE;
}

// Loads a font asset through the Java asset manager and returns the width,
// in ems, of `text` laid out with it.
extern "C" JNIEXPORT jfloat JNICALL Java_org_vexel_KitProbe_measureWithAssetFont(
    JNIEnv* env, jclass, jobject assetManager, jstring fontName, jstring text) {
  try {
    Vexel::Kit kit(AAssetManager_fromJava(env, assetManager), "");
    Vexel::Font font(ToString(env, fontName), Vexel::Font::FILE_TYPE_ASSET, true);
    Vexel::Text laid_out;
    laid_out.setFont(font);
    laid_out.setText(ToString(env, text));
    return laid_out.getBoundingBox().width();
  } catch (const std::exception& error) {
    ThrowJava(env, error.what());
    return 0.0f;
  }
}
