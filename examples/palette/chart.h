// A chart of the palette's colours, and a picture reduced to them.
#ifndef PALETTE_CHART_H
#define PALETTE_CHART_H

#include <basalt/graphics.h>

#include <string>

#include "scene.h"

inline constexpr int SCENE_WIDTH = 448;
inline constexpr int SCENE_HEIGHT = 300;

/// Draws the chart and writes it to a file. std::runtime_error when that fails.
void write_chart(const ColorPalette& palette, const Canvas& scene, const Matched& matched,
                 const std::string& file);

#endif
