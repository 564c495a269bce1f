#pragma once

// The whole scene kit.
#include "vexel/Camera.h"
#include "vexel/Exception.h"
#include "vexel/Font.h"
#include "vexel/Kit.h"
#include "vexel/Material.h"
#include "vexel/Math.h"
#include "vexel/Mesh.h"
#include "vexel/Node.h"
#include "vexel/Object.h"
#include "vexel/Renderer.h"
#include "vexel/Scene.h"
#include "vexel/Text.h"
#include "vexel/Texture.h"
