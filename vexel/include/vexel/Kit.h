#pragma once

#include <cstddef>
#include <memory>
#include <string>

#include "vexel/Exception.h"

struct AAssetManager;

namespace Vexel {

// Where materials and textures are made: shader programs are compiled once
// per pair of sources and shared by every material that uses them.
class ResourceManager {
 public:
  ~ResourceManager();
  ResourceManager(const ResourceManager&) = delete;
  ResourceManager& operator=(const ResourceManager&) = delete;

  class Impl;

 private:
  friend class Kit;
  friend struct detail::Access;
  explicit ResourceManager(std::shared_ptr<Impl> impl);
  std::shared_ptr<Impl> impl_;
};

// One instance of the kit: its asset manager (fonts of file type asset are
// read through it), its log and the renderers created on it.
//
// The most recently created Kit that is still alive is the process's current
// kit; the constructors that take no kit (Camera, EmptyNode, Mesh, Object,
// Font, Text) use it. Objects made on a kit may outlive it: a kit can be
// replaced by a new one before the renderer, scene and resources made on the
// old one are destroyed.
//
// Every kit call comes from one thread (the render thread): the process's
// one graphics context stays current on the thread that used it last.
class Kit {
 public:
  // `assets` may be null (then only fonts by path or platform fonts load).
  // `logFile` is the kit's own log: an absolute path is used as it stands, a
  // bare name is placed in the platform's log directory (on Linux
  // $VEXEL_LOG_DIR, else $XDG_STATE_HOME/vexel, else the temp directory's
  // "vexel"; on Android only when VEXEL_LOG_DIR is set, and always the system
  // log under the tag "Vexel"); an empty name writes no file.
  Kit(AAssetManager* assets, const std::string& logFile);
  ~Kit();
  Kit(const Kit&) = delete;
  Kit& operator=(const Kit&) = delete;

  // Draws the scene of every renderer created on this kit and presents it.
  void drawAll();

  ResourceManager& getResourceManager();
  AAssetManager* getAssetManager() const;
  // The log file actually written, empty when none.
  const std::string& getLogFilePath() const;

  // The current kit, or null when no kit is alive.
  static Kit* getCurrent();
  // Graphics objects (textures, buffers, shaders, programs, framebuffers)
  // that the kit holds right now, across all kits of the process.
  static std::size_t getLiveGpuObjectCount();

  class Impl;

 private:
  friend struct detail::Access;
  std::shared_ptr<Impl> impl_;
  std::unique_ptr<ResourceManager> resources_;
};

}  // namespace Vexel
