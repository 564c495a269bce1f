#include "renderer/renderer_bridge.h"

#include <android/native_window.h>

#include <exception>
#include <opencv2/core/mat.hpp>

#include "common/log.h"
#include "renderer/frame_mapping.h"
#include "renderer/scene_handler.h"

namespace ocr_ar::bridge {
namespace {

AAssetManager* s_asset_manager = nullptr;
ANativeWindow* s_native_window = nullptr;
float s_background_width = 0.0f;
float s_background_height = 0.0f;
int s_orientation = 0;
bool s_render_translate = false;
// Converted camera frames, kept between frames to save the allocation.
cv::Mat s_background_scratch;

// Runs one scene handler call; any exception is logged as `message` (which
// names the call) and swallowed, so the bridge carries on with the frame.
template <typename Call>
void Guarded(const char* message, Call&& call) {
  try {
    call();
  } catch (...) {
    OCR_LOGE("%s", message);
  }
}

CameraView CurrentCameraView(SceneHandler& handler) {
  CameraView view;
  handler.GetOrthoCameraWidthHeight(&view.camera_width, &view.camera_height);
  handler.GetBackgroundRectCorners(&view.corners.left, &view.corners.top, &view.corners.right,
                                   &view.corners.bottom);
  view.bg_width = s_background_width;
  view.bg_height = s_background_height;
  return view;
}

// One text into slot `index`: both rectangles through the orientation into
// camera space (the patch with its margin), the colour matched to the frame.
void DrawText(SceneHandler& handler, std::size_t index, const TextRecord& record,
              const CameraView& view) {
  const ImageRect patch_rect =
      OrientRect(record.patch_rect, s_orientation, view.bg_width, view.bg_height);
  const ImageRect text_rect =
      OrientRect(record.text_rect, s_orientation, view.bg_width, view.bg_height);
  const PositionScaleAngle patch_placement = ToCameraRecord(patch_rect, view, kPatchWidthMargin);
  const PositionScaleAngle text_placement = ToCameraRecord(text_rect, view);
  const PatchRecord& patch = record.patch;
  const Color colour = CorrectColor(record.color, patch.color_scale, patch.color_shift);
  Guarded("Vexel: Caught exception creating text object.", [&] {
    handler.DrawTextObject(static_cast<unsigned int>(index), record.text, text_placement, colour,
                           patch.id, patch.data, patch.color_scale, patch.color_shift, patch.width,
                           patch.height, patch_placement);
  });
}

}  // namespace

void SetAssetManager(AAssetManager* assets) {
  s_asset_manager = assets;
}

bool InitFromSurface(const std::function<ANativeWindow*()>& acquire_window, int backgroundWidth,
                     int backgroundHeight) {
  try {
    if (s_native_window != nullptr) {
      OCR_LOGE("Vexel: initFromSurface called with non-null s_native_window!");
      ShutDown();
    }
    s_native_window = acquire_window();
    if (s_native_window == nullptr) {
      OCR_LOGE("Vexel: Init failed, s_native_window is null!");
      return true;
    }
    const int width = ANativeWindow_getWidth(s_native_window);
    const int height = ANativeWindow_getHeight(s_native_window);
    OCR_LOGI("Vexel: Init renderer %d %d.", width, height);
    if (width < 1 || height < 1) {
      OCR_LOGE("Vexel: The size of the window is negative");
      return true;
    }
    SceneHandler::Instance()->Init(s_native_window, s_asset_manager, width, height,
                                   Vexel::Vector3(0, 0, 0), Vexel::Vector3(0, 0, 500));
    InitBackground(s_native_window, backgroundWidth, backgroundHeight, s_orientation);
    return true;
  } catch (const std::exception& error) {
    OCR_LOGE("Vexel: initFromSurface() ERROR: %s", error.what());
  } catch (...) {
    OCR_LOGE("Vexel: initFromSurface() caught unexpected exception.");
  }
  return false;
}

void InitBackground(ANativeWindow* window, int backgroundWidth, int backgroundHeight,
                    int rotation) {
  const int window_width = ANativeWindow_getWidth(window);
  const int window_height = ANativeWindow_getHeight(window);
  OCR_LOGI("Vexel: Init background %d %d.", backgroundWidth, backgroundHeight);
  OCR_LOGD("VexelJNI::InitBackground background_width = %d, background_height = %d \r\n",
           backgroundWidth, backgroundHeight);
  OCR_LOGD("VexelJNI::InitBackground native_window_width = %d, native_window_height = %d \r\n",
           window_width, window_height);
  OCR_LOGD("VexelJNI::InitBackground rotation = %d \r\n", rotation);

  const BackgroundCorners c =
      FitBackground(window_width, window_height, backgroundWidth, backgroundHeight);
  // Under a quarter turn the host's frames stand the other way round.
  const bool quarter_turn = !(rotation == 0 || rotation == 180);
  SceneHandler::Instance()->CreateBackground(quarter_turn ? backgroundHeight : backgroundWidth,
                                             quarter_turn ? backgroundWidth : backgroundHeight,
                                             rotation, c.left, c.top, c.right, c.bottom);
  s_orientation = rotation;
  s_background_width = static_cast<float>(backgroundWidth);
  s_background_height = static_cast<float>(backgroundHeight);
}

void ShutDown() {
  OCR_LOGI("Vexel: shutDown renderer.");
  Guarded("Vexel: caught unexpected exception in Shutdown.", [] {
    SceneHandler::DeleteInstance();
    if (s_native_window != nullptr) {
      ANativeWindow_release(s_native_window);
      s_native_window = nullptr;
    }
  });
}

void SetOrientation(int orientation) {
  OCR_LOGI("Vexel: Set renderer orientation %d.", orientation);
  Guarded("Vexel: caught unexpected exception in ResetBackground.", [orientation] {
    SceneHandler* handler = SceneHandler::Instance();
    if (!handler->HasRenderer())
      return;
    handler->ClearAllTextObjects(false);
    InitBackground(s_native_window, static_cast<int>(s_background_width),
                   static_cast<int>(s_background_height), orientation);
  });
}

void SetTranslationLanguage(const char* language) {
  OCR_LOGI("Vexel: set translation language: %s", language);
  const std::string copy(language);
  Guarded("Vexel: caught exception from SceneHandler::SetTranslationLanguage.",
          [&copy] { SceneHandler::Instance()->SetTranslationLanguage(copy); });
}

void SetTranslationLanguageFont(const char* language, const char* fontPath) {
  const char* path = fontPath != nullptr ? fontPath : "";
  OCR_LOGI("Vexel: set translation language %s to use font: %s", language, path);
  const std::string language_copy(language);
  const std::string path_copy(path);
  if (!path_copy.empty()) {
    Guarded("Vexel: caught exception from SceneHandler::SetTranslationLanguageFont.", [&] {
      SceneHandler::Instance()->SetTranslationLanguageFont(language_copy, path_copy);
    });
  } else {
    Guarded("Vexel: caught exception from SceneHandler::SetTranslationLanguageUseDefaultFont.",
            [&] { SceneHandler::Instance()->SetTranslationLanguageUseDefaultFont(language_copy); });
  }
}

void RenderOneFrame(const cv::Mat* image, std::size_t textCount, const TextReader& readText,
                    const FrameArrays& arrays, FrameEnd end) {
  if (end == FrameEnd::kDraw) {
    OCR_LOGI("Vexel: renderOneFrame image(%p %d %d) text(%d)",
             image != nullptr ? static_cast<const void*>(image->data) : nullptr,
             image != nullptr ? image->cols : 0, image != nullptr ? image->rows : 0,
             static_cast<int>(textCount));
  }
  SceneHandler& handler = *SceneHandler::Instance();
  if (!handler.HasRenderer())
    return;

  // 1. The camera frame into the background texture.
  if (image != nullptr && image->data != nullptr) {
    Guarded("Vexel: Caught exception in SceneHandler::UpdateBackgroundImage.", [&] {
      handler.UpdateBackgroundImage(BackgroundRgba(*image, s_background_scratch), image->cols,
                                    image->rows);
    });
  }

  // 2. The texts: none clears them all (kept for reuse); otherwise last
  // frame's texts become reusable, each text is drawn into its slot and the
  // slots past the last text are cleared.
  s_render_translate = textCount > 0;
  if (textCount == 0) {
    Guarded("Vexel: Caught exception in SceneHandler::ClearAllTextObjects.",
            [&] { handler.ClearAllTextObjects(false); });
  } else {
    if (!HasAllRects(arrays, textCount)) {
      OCR_LOGE(
          "Vexel: renderOneFrame needs 5 values per text in patchRects and textRects; "
          "missing rectangles are drawn empty.");
    }
    Guarded("Vexel: Caught exception in SceneHandler::UpdateTextObjectCache.",
            [&] { handler.UpdateTextObjectCache(); });
    const CameraView view = CurrentCameraView(handler);
    for (std::size_t i = 0; i < textCount; ++i) {
      std::optional<std::string> text = readText(i);
      if (!text)
        OCR_LOGE("Vexel: GetStringUTFChars failed.");
      const TextRecord record =
          text ? UnpackTextRecord(arrays, i, std::move(*text)) : UnreadableTextRecord();
      DrawText(handler, i, record, view);
    }
    Guarded("Vexel: Caught exception clearing remaining text objects.",
            [&] { handler.ClearTextObjects(static_cast<unsigned int>(textCount), false); });
  }

  // 3. The draw.
  if (end == FrameEnd::kDraw) {
    Guarded("Vexel: Caught exception in SceneHandler::RenderOneFrame.",
            [&] { handler.RenderOneFrame(); });
  }
}

bool GetRenderTranslate() {
  return s_render_translate;
}

std::size_t MatByteBufferCapacity(const cv::Mat& mat) {
  return static_cast<std::size_t>(mat.rows) * static_cast<std::size_t>(mat.cols) * mat.elemSize1();
}

}  // namespace ocr_ar::bridge
