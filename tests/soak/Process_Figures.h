#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace KPRV {

/// What a process takes from its machine at one moment, and what its provider holds of its server.
struct Process_Figures
{
    double seconds = 0;
    double resident_kib = 0;
    /// In use, as the main arena of the allocator counts it.
    double heap_kib = 0;
    double descriptors = 0;
    double threads = 0;
    double live_objects = 0;
};

/// All that the process itself can tell; the time and the objects are left to the caller.
Process_Figures process_figures();

/// One line of a plot.
struct Figure_Series
{
    const char* name;
    double Process_Figures::*member;
};

/// The figures in the order in which they are plotted and judged.
extern const std::vector<Figure_Series> figure_series;

/// How much a figure rose from the second quarter to the last, as medians, which a moment's peak does not
/// move. The first quarter is for caches to fill.
double rise(const std::vector<Process_Figures>& samples, double Process_Figures::*member);

/// All series over time, one below the other, as SVG.
std::string figures_svg(const std::vector<Process_Figures>& samples);

} // namespace KPRV
