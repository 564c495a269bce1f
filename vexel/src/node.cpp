#include <algorithm>

#include "access.h"
#include "node_impl.h"

namespace Vexel {

Node::Impl::~Impl() = default;

void Node::Impl::Detach() {
  if (parent == nullptr)
    return;
  auto& siblings = parent->children;
  siblings.erase(std::remove(siblings.begin(), siblings.end(), this), siblings.end());
  parent = nullptr;
}

void Node::Impl::AttachTo(Impl* new_parent) {
  if (new_parent == parent)
    return;
  for (Impl* ancestor = new_parent; ancestor != nullptr; ancestor = ancestor->parent) {
    if (ancestor == this)
      throw Exception("Vexel: a node cannot be attached under itself or its descendants");
  }
  Detach();
  if (new_parent != nullptr) {
    new_parent->children.push_back(this);
    parent = new_parent;
  }
}

void Node::Impl::DetachChildren() {
  for (Impl* child : children)
    child->parent = nullptr;
  children.clear();
}

internal::Matrix4 Node::Impl::WorldMatrix() const {
  internal::Matrix4 world = LocalMatrix();
  for (const Impl* node = parent; node != nullptr; node = node->parent)
    world = node->LocalMatrix() * world;
  return world;
}

Node::Node(std::unique_ptr<Impl> impl) : impl_(std::move(impl)) {
  impl_->owner = this;
}

Node::~Node() {
  impl_->Detach();
  impl_->DetachChildren();
}

void Node::setParent(Node* parent) {
  impl_->AttachTo(parent != nullptr ? parent->impl_.get() : nullptr);
}

void Node::addChild(Node* child) {
  if (child != nullptr)
    child->setParent(this);
}

void Node::removeChild(Node* child) {
  if (child != nullptr && child->impl_->parent == impl_.get())
    child->impl_->Detach();
}

void Node::removeAllChildren() {
  impl_->DetachChildren();
}

Node* Node::getParent() const {
  return impl_->parent != nullptr ? impl_->parent->owner : nullptr;
}

std::size_t Node::getChildCount() const {
  return impl_->children.size();
}

Node* Node::getChild(std::size_t index) const {
  return index < impl_->children.size() ? impl_->children[index]->owner : nullptr;
}

void Node::setPosition(const Vector3& position) {
  impl_->position = position;
}

void Node::setPosition(float x, float y, float z) {
  impl_->position = Vector3(x, y, z);
}

Vector3 Node::getPosition() const {
  return impl_->position;
}

void Node::setScale(const Vector3& scale) {
  impl_->scale = scale;
}

void Node::setScale(float x, float y, float z) {
  impl_->scale = Vector3(x, y, z);
}

Vector3 Node::getScale() const {
  return impl_->scale;
}

void Node::setRotation(const Degrees& angle) {
  impl_->rotation = angle.valueDegrees();
}

Degrees Node::getRotation() const {
  return Degrees(impl_->rotation);
}

void Node::setVisible(bool visible) {
  impl_->visible = visible;
}

bool Node::isVisible() const {
  return impl_->visible;
}

EmptyNode::EmptyNode() : Node(std::make_unique<Impl>()) {}
EmptyNode::~EmptyNode() = default;

}  // namespace Vexel
