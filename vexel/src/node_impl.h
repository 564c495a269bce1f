#pragma once

#include <vector>

#include "matrix.h"
#include "vexel/Node.h"

namespace Vexel {

namespace internal {
struct DrawContext;
class CameraImpl;
}  // namespace internal

// The graph side of a node. Parent and child links are plain pointers kept
// consistent by both ends: a node's destructor unlinks it from its parent
// and its children.
class Node::Impl {
 public:
  Impl() = default;
  virtual ~Impl();
  Impl(const Impl&) = delete;
  Impl& operator=(const Impl&) = delete;

  // Detaches from the parent, if any.
  void Detach();
  void AttachTo(Impl* new_parent);
  void DetachChildren();

  internal::Matrix4 LocalMatrix() const {
    return internal::Matrix4::Transform(position, scale, rotation);
  }
  internal::Matrix4 WorldMatrix() const;

  // Draws this node's own content (not its children) with its world matrix.
  virtual void Draw(const internal::Matrix4& /*world*/, internal::DrawContext& /*context*/) {}
  virtual internal::CameraImpl* AsCamera() { return nullptr; }

  Node* owner = nullptr;
  Impl* parent = nullptr;
  std::vector<Impl*> children;
  Vector3 position;
  Vector3 scale{1.0f, 1.0f, 1.0f};
  float rotation = 0.0f;
  bool visible = true;
};

}  // namespace Vexel
