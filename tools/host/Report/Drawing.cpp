#include "Report/Drawing.h"

#include <algorithm>
#include <string_view>

#include <fmt/format.h>

#include "Report/Gnuplot.h"
#include "Report/Html.h"
#include "Report/Units.h"

namespace vantelhost {

namespace {

constexpr std::string_view prologue = R"(set encoding utf8
set terminal svg size {width},{height} dynamic noenhanced rounded font "sans-serif,13" name "{name}"
set lmargin at screen 0.15
set rmargin at screen 0.98
set tics nomirror out
set grid lc rgb "gray"
unset key
)";

void replaceAll(std::string& text, std::string_view from, const std::string& to) {
    for (auto at = text.find(from); at != std::string::npos; at = text.find(from, at + to.size())) {
        text.replace(at, from.size(), to);
    }
}

/// Takes away what stands from one text to the end of another.
void cut(std::string& text, std::string_view from, std::string_view to) {
    const auto begin = text.find(from);
    const auto end = text.find(to, begin);
    if (begin != std::string::npos && end != std::string::npos) {
        text.erase(begin, end + to.size() - begin);
    }
}

/// What gnuplot writes, as a part of a page: ids are the drawing's own, and the title speaks.
std::string inPage(std::string svg, const Caption& caption) {
    svg.erase(0, svg.find("<svg"));
    cut(svg, "<desc>", "</desc>");
    // The drawing's and the line's: nothing that helps a reader.
    cut(svg, "<title>", "</title>");
    cut(svg, "<title>", "</title>");
    cut(svg, "<filter", "</filter>");
    cut(svg, "<filter", "</filter>");
    replaceAll(svg, "id='", "id='" + caption.name + "-");
    replaceAll(svg, "href='#", "href='#" + caption.name + "-");
    replaceAll(svg, "\"gnuplot_canvas\"", "\"" + caption.name + "\"");
    svg.insert(std::string_view("<svg").size(), " role=\"img\"");
    svg.insert(svg.find('>') + 1, "<title>" + escaped(caption.title) + "</title>");
    return "<figure>" + svg + "</figure>\n";
}

} // namespace

std::string draw(const Caption& caption, std::size_t height, const std::string& commands) {
    const auto begin = fmt::format(prologue, fmt::arg("width", drawingWidth),
                                   fmt::arg("height", height), fmt::arg("name", caption.name));
    return inPage(runGnuplot(begin + commands), caption);
}

std::string timeAxis(double duration, const Unit& unit) {
    const double end = std::max(duration, 1e-6) * 1e9 / unit.size;
    return fmt::format("set xlabel \"time since the host's start in {}\"\nset xrange [0:{:.9g}]\n",
                       unit.name, end);
}

} // namespace vantelhost
