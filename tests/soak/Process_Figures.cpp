#include "tests/soak/Process_Figures.h"

#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <malloc.h>

#include <unistd.h>

namespace KPRV {

namespace {

double entries_of(const char* folder)
{
    double count = 0;
    for ([[maybe_unused]] const auto& entry : std::filesystem::directory_iterator(folder))
        ++count;
    return count;
}

double median(std::vector<double> values)
{
    if (values.empty())
        return 0;
    std::ranges::nth_element(values, values.begin() + static_cast<std::ptrdiff_t>(values.size() / 2));
    return values[values.size() / 2];
}

constexpr double WIDTH = 900;
constexpr double HEIGHT = 110;
constexpr double LEFT = 150;

std::string line_of(const std::vector<Process_Figures>& samples, const Figure_Series& series, double top)
{
    double least = samples.front().*series.member;
    double most = least;
    for (const Process_Figures& sample : samples) {
        least = std::min(least, sample.*series.member);
        most = std::max(most, sample.*series.member);
    }
    // From zero, so that what is flat looks flat.
    const double scale = most > 0 ? (HEIGHT - 30) / most : 0;
    const double length = std::max(samples.back().seconds, 1.0);
    char text[256];
    std::snprintf(text, sizeof text,
                  "<text x=\"4\" y=\"%.0f\">%s</text><text x=\"4\" y=\"%.0f\">%.0f to %.0f</text>\n"
                  "<polyline fill=\"none\" stroke=\"#205080\" points=\"",
                  top + 40, series.name, top + 58, least, most);
    std::string svg = text;
    for (const Process_Figures& sample : samples) {
        std::snprintf(text, sizeof text, "%.1f,%.1f ", LEFT + sample.seconds / length * (WIDTH - LEFT - 10),
                      top + HEIGHT - 10 - sample.*series.member * scale);
        svg += text;
    }
    return svg + "\"/>\n";
}

} // namespace

const std::vector<Figure_Series> figure_series = {
    {"resident KiB", &Process_Figures::resident_kib},      {"heap KiB", &Process_Figures::heap_kib},
    {"descriptors", &Process_Figures::descriptors},        {"threads", &Process_Figures::threads},
    {"live CMPI objects", &Process_Figures::live_objects},
};

Process_Figures process_figures()
{
    Process_Figures figures;
    double pages = 0;
    double resident_pages = 0;
    std::ifstream("/proc/self/statm") >> pages >> resident_pages;
    figures.resident_kib = resident_pages * static_cast<double>(sysconf(_SC_PAGESIZE)) / 1024;
    const struct mallinfo2 heap = mallinfo2();
    figures.heap_kib = static_cast<double>(heap.uordblks + heap.hblkhd) / 1024;
    figures.descriptors = entries_of("/proc/self/fd");
    figures.threads = entries_of("/proc/self/task");
    return figures;
}

double rise(const std::vector<Process_Figures>& samples, double Process_Figures::*member)
{
    const std::size_t quarter = samples.size() / 4;
    std::vector<double> early;
    std::vector<double> late;
    for (std::size_t i = quarter; i < samples.size(); ++i) {
        if (i < 2 * quarter)
            early.push_back(samples[i].*member);
        else if (i >= 3 * quarter)
            late.push_back(samples[i].*member);
    }
    return median(std::move(late)) - median(std::move(early));
}

std::string figures_svg(const std::vector<Process_Figures>& samples)
{
    char head[160];
    std::snprintf(head, sizeof head,
                  "<svg xmlns=\"http://www.w3.org/2000/svg\" width=\"%.0f\" height=\"%.0f\" "
                  "font-family=\"sans-serif\" font-size=\"13\">\n",
                  WIDTH, HEIGHT * static_cast<double>(figure_series.size()) + 20);
    std::string svg = head;
    double top = 0;
    for (const Figure_Series& series : figure_series) {
        if (!samples.empty())
            svg += line_of(samples, series, top);
        top += HEIGHT;
    }
    return svg + "</svg>\n";
}

} // namespace KPRV
