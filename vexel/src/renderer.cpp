#include <algorithm>
#include <stdexcept>

#include "access.h"
#include "camera_impl.h"
#include "draw_context.h"
#include "renderer_impl.h"
#include "scene_impl.h"

namespace Vexel {
namespace {

using internal::Matrix4;

internal::CameraImpl* FindCamera(Node::Impl& node) {
  if (!node.visible)
    return nullptr;
  if (internal::CameraImpl* camera = node.AsCamera())
    return camera;
  for (Node::Impl* child : node.children) {
    if (internal::CameraImpl* camera = FindCamera(*child))
      return camera;
  }
  return nullptr;
}

void DrawTree(Node::Impl& node, const Matrix4& parent_world, internal::DrawContext& context) {
  if (!node.visible)
    return;
  const Matrix4 world = parent_world * node.LocalMatrix();
  node.Draw(world, context);
  // A copy: a child's Draw cannot change the graph, but keep iteration safe.
  const std::vector<Node::Impl*> children = node.children;
  for (Node::Impl* child : children)
    DrawTree(*child, world, context);
}

}  // namespace

Renderer::Impl::Impl(std::shared_ptr<Kit::Impl> owner, ANativeWindow* window)
    : kit(std::move(owner)) {
  if (window == nullptr)
    throw Exception("Vexel: a surface renderer needs a window, got null");
  gpu = internal::Gpu::Acquire();
  try {
    surface = platform::WindowSurface::Create(gpu->device(), window);
  } catch (const std::runtime_error& error) {
    throw Exception(std::string("Vexel: cannot draw into the window: ") + error.what());
  }
  kit->renderers.push_back(this);
  kit->log.Write(internal::KitLog::kInfo, "Vexel: renderer " + std::to_string(surface->Width()) +
                                              "x" + std::to_string(surface->Height()) + " on " +
                                              gpu->device()->Description());
}

Renderer::Impl::~Impl() {
  auto& renderers = kit->renderers;
  renderers.erase(std::remove(renderers.begin(), renderers.end(), this), renderers.end());
}

void Renderer::Impl::Draw() {
  const int width = surface->Width();
  const int height = surface->Height();
  if (width <= 0 || height <= 0)
    return;
  surface->MakeCurrent();
  glViewport(0, 0, width, height);
  std::shared_ptr<Scene::Impl> drawn = scene_alive.lock();
  const Color clear = drawn ? drawn->background : Color(0, 0, 0, 0);
  glDepthMask(GL_TRUE);
  glClearColor(clear.r, clear.g, clear.b, clear.a);
  glClearDepthf(1.0f);
  glClear(GL_COLOR_BUFFER_BIT | GL_DEPTH_BUFFER_BIT);
  if (drawn) {
    Node::Impl& root = internal::Access::ImplOf<Node>(drawn->root);
    internal::CameraImpl* camera = FindCamera(root);
    if (camera != nullptr) {
      internal::DrawContext context;
      context.viewport_width = width;
      context.viewport_height = height;
      context.log = &kit->log;
      const Matrix4 view = camera->WorldMatrix().AffineInverse();
      context.view_projection =
          camera->Projection(static_cast<float>(width) / static_cast<float>(height)) * view;
      DrawTree(root, Matrix4::Identity(), context);
    } else if (!warned_no_camera) {
      kit->log.Write(internal::KitLog::kWarning,
                     "Vexel: the scene has no camera; only its background colour is drawn");
      warned_no_camera = true;
    }
  }
  surface->Present();
}

Renderer::Renderer(std::unique_ptr<Impl> impl) : impl_(std::move(impl)) {}
Renderer::~Renderer() = default;

void Renderer::setScene(Scene* scene) {
  impl_->scene = scene;
  impl_->scene_alive =
      scene != nullptr ? internal::Access::SharedImplOf(*scene) : std::weak_ptr<Scene::Impl>();
}

Scene* Renderer::getScene() const {
  return impl_->scene_alive.expired() ? nullptr : impl_->scene;
}

int Renderer::getWidth() const {
  return impl_->surface->Width();
}

int Renderer::getHeight() const {
  return impl_->surface->Height();
}

void Renderer::draw() {
  impl_->Draw();
}

AndroidSurfaceRenderer::AndroidSurfaceRenderer(Kit& kit, ANativeWindow* window,
                                               AntiAliasingSamples /*samples*/)
    : Renderer(std::make_unique<Impl>(internal::Access::SharedImplOf(kit), window)) {}

AndroidSurfaceRenderer::~AndroidSurfaceRenderer() = default;

}  // namespace Vexel
