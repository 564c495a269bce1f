#pragma once

#include <cstddef>
#include <memory>

#include "vexel/Exception.h"
#include "vexel/Math.h"

namespace Vexel {

// A node of the scene graph. Each node has a position, a scale and an
// in-plane rotation (about z, counter-clockwise in degrees), applied to its
// contents in the order scale, rotate, translate, and composed with those of
// its ancestors. Children are drawn after their parent, in the order in which
// they were attached.
//
// Nodes are owned by the caller, never by the graph: destroying a node
// detaches it from its parent and detaches its children (which stay alive,
// parentless), so no parent pointer dangles whatever the order of
// destruction.
class Node {
 public:
  virtual ~Node();
  Node(const Node&) = delete;
  Node& operator=(const Node&) = delete;

  // Moves this node under `parent`, at the end of its children; null detaches
  // it. Attaching a node under itself or under one of its descendants throws
  // Vexel::Exception and changes nothing.
  void setParent(Node* parent);
  // Same as child->setParent(this); null is ignored.
  void addChild(Node* child);
  // Detaches `child` if it is a child of this node; otherwise does nothing.
  void removeChild(Node* child);
  void removeAllChildren();
  Node* getParent() const;
  std::size_t getChildCount() const;
  // Null when index is out of range.
  Node* getChild(std::size_t index) const;

  void setPosition(const Vector3& position);
  void setPosition(float x, float y, float z);
  Vector3 getPosition() const;
  void setScale(const Vector3& scale);
  void setScale(float x, float y, float z);
  Vector3 getScale() const;
  void setRotation(const Degrees& angle);
  Degrees getRotation() const;
  // An invisible node is not drawn, nor is anything below it.
  void setVisible(bool visible);
  bool isVisible() const;

  class Impl;

 protected:
  explicit Node(std::unique_ptr<Impl> impl);

 private:
  friend struct detail::Access;
  std::unique_ptr<Impl> impl_;
};

// A node that draws nothing: it groups and places its children.
class EmptyNode : public Node {
 public:
  EmptyNode();
  ~EmptyNode() override;
};

}  // namespace Vexel
