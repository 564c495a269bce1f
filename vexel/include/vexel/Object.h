#pragma once

#include "vexel/Node.h"

namespace Vexel {

class Material;
class Mesh;

// A node that draws a mesh with a material. The mesh is shared, not owned
// (the object keeps the geometry alive), and so are the materials: a material
// destroyed while still set is treated as unset. A mesh is one part, drawn
// with material 0; an object without material 0 draws nothing.
class Object : public Node {
 public:
  explicit Object(const Mesh& mesh);
  ~Object() override;

  void setMaterial(unsigned int index, Material* material);
  // Null when none is set at that index.
  Material* getMaterial(unsigned int index) const;
};

}  // namespace Vexel
