#pragma once

// A recording implementation of the scene kit's interface (vexel/*.h) for
// the renderer's C++ tests, linked in place of libVexelKit: no graphics
// device. It defines only the operations the renderer calls (plus a few
// getters of the real interface the tests read), keeps the scene graph and
// node transforms, and writes object lifetimes and the calls the tests check
// to one journal, in order, with their arguments: "Kit Vexel.log",
// "Texture.setImage InpaintedTexture0 8 6 8", "~Texture RenderTexture"...
//
// Text metrics are made up: half an em per byte plus the extra spacing
// between neighbours; the line box is 1.2 em tall with its top at y = 0 and
// it is centred on x = 0; the glyphs' ink spans y = -0.3 to -0.9 and the
// line ink box y = -0.2 to -1.1.

#include <map>
#include <set>
#include <string>
#include <vector>

#include "vexel/Vexel.h"

namespace vexel_recording {

std::vector<std::string>& Journal();
// Number of journal entries equal to `entry`, or starting with it when it
// ends with '*'.
int CountEntries(const std::string& entry);
// Index of the first entry equal to `entry` at or after `from`; -1 if none.
int FindEntry(const std::string& entry, int from = 0);

// Journaled operations, named by their entry's first word ("Kit.drawAll",
// "Font", "Node.removeChild"...), that throw Vexel::Exception while listed.
std::set<std::string>& Failures();

// Objects of a kit class ("Text", "Texture", "Material"...) alive now.
int& LiveCount(const std::string& class_name);

struct MeshData {
  std::vector<Vexel::Vector3> positions;
  std::vector<Vexel::Vector2> uvs;
};
const MeshData& MeshOf(const Vexel::Object& object);
// Vector uniforms by name, as last set.
const std::map<std::string, Vexel::Vector3>& UniformsOf(const Vexel::Material& material);

}  // namespace vexel_recording
