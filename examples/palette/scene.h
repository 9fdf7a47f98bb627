// A generated scene with the smooth gradients of a photograph.
#ifndef PALETTE_SCENE_H
#define PALETTE_SCENE_H

#include "canvas.h"

/// Evening sky, hills in haze and a lake, the same on every run.
Canvas make_scene(int width, int height);

#endif
