#pragma once

#include <string>

#include "programs/varnel-decode/plot/Plot.h"

/// The one entry of the module that draws pictures, which is a library of its own that the program loads when
/// it needs it: no other use of the program pays for what drawing takes.
extern "C" {
/// Draws the plot as SVG, without a display; at most once in the life of a process.
void varnelDrawPlot(const varnel::Plot& plot, std::string& svg);
}
