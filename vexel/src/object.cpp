#include <memory>
#include <vector>

#include "access.h"
#include "material_impl.h"
#include "mesh_impl.h"
#include "node_impl.h"
#include "vexel/Object.h"

namespace Vexel {
namespace {

class ObjectImpl : public Node::Impl {
 public:
  explicit ObjectImpl(std::shared_ptr<Mesh::Impl> shared_mesh) : mesh(std::move(shared_mesh)) {}

  void Draw(const internal::Matrix4& world, internal::DrawContext& context) override {
    if (materials.empty())
      return;
    std::shared_ptr<Material::Impl> material = materials[0].alive.lock();
    if (!material)
      return;
    if (const internal::Program* program = material->Apply(world, context))
      mesh->Draw(*program);
  }

  struct Slot {
    Material* material = nullptr;
    std::weak_ptr<Material::Impl> alive;
  };

  std::shared_ptr<Mesh::Impl> mesh;
  std::vector<Slot> materials;
};

ObjectImpl& Of(const Object& object) {
  return static_cast<ObjectImpl&>(internal::Access::ImplOf<Node>(object));
}

}  // namespace

Object::Object(const Mesh& mesh)
    : Node(std::make_unique<ObjectImpl>(internal::Access::SharedImplOf(mesh))) {}

Object::~Object() = default;

void Object::setMaterial(unsigned int index, Material* material) {
  // A mesh has one part; a few more slots are kept for callers that set them.
  constexpr unsigned int kMaxSlots = 64;
  if (index >= kMaxSlots)
    throw Exception("Vexel: material index " + std::to_string(index) + " is out of range");
  auto& slots = Of(*this).materials;
  if (slots.size() <= index)
    slots.resize(index + 1);
  slots[index].material = material;
  slots[index].alive = material != nullptr ? internal::Access::SharedImplOf(*material)
                                           : std::weak_ptr<Material::Impl>();
}

Material* Object::getMaterial(unsigned int index) const {
  const auto& slots = Of(*this).materials;
  if (index >= slots.size() || slots[index].alive.expired())
    return nullptr;
  return slots[index].material;
}

}  // namespace Vexel
