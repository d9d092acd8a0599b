#pragma once

#include <string>

#include "programs/varnel-decode/plot/Plot.h"

/// The one function of the module that draws pictures. The module is a separate library, which the program
/// loads only when it draws, so that no other use pays for it.
extern "C" {
/// Draws the plot as SVG. Needs no display. Call it at most once per process.
void varnelDrawPlot(const varnel::Plot& plot, std::string& svg);
}
