#include "Report/Drawing.h"

#include <string_view>

#include <fmt/format.h>

#include "Report/Gnuplot.h"
#include "Report/Html.h"

namespace vantelhost {

namespace {

constexpr std::string_view prologue = R"(set encoding utf8
set terminal svg size {width},{height} dynamic noenhanced rounded font "sans-serif,13" name "{name}"
set lmargin at screen {left}
set rmargin at screen 0.96
set tics nomirror out
set xlabel offset 0,0.4
set x2label offset 0,-0.4
set ylabel offset 1,0
set grid lc rgb "gray"
unset key
)";

void replaceAll(std::string& text, std::string_view from, const std::string& to) {
    for (auto at = text.find(from); at != std::string::npos; at = text.find(from, at + to.size())) {
        text.replace(at, from.size(), to);
    }
}

/// Takes away all that stands from one text to the end of another.
void cut(std::string& text, std::string_view from, std::string_view to) {
    for (auto begin = text.find(from); begin != std::string::npos; begin = text.find(from, begin)) {
        const auto end = text.find(to, begin);
        if (end == std::string::npos) {
            return;
        }
        text.erase(begin, end + to.size() - begin);
    }
}

/// What gnuplot writes, as a part of a page: ids are the drawing's own, and the title speaks.
std::string inPage(std::string svg, const std::string& name, const std::string& title,
                   const char* kind) {
    svg.erase(0, svg.find("<svg"));
    cut(svg, "<desc>", "</desc>");
    // The drawing's and the lines': nothing that helps a reader.
    cut(svg, "<title>", "</title>");
    cut(svg, "<filter", "</filter>");
    replaceAll(svg, "id='", "id='" + name + "-");
    replaceAll(svg, "href='#", "href='#" + name + "-");
    replaceAll(svg, "\"gnuplot_canvas\"", "\"" + name + "\"");
    svg.insert(std::string_view("<svg").size(), fmt::format(R"( role="img" class="{}")", kind));
    svg.insert(svg.find('>') + 1, "<title>" + escaped(title) + "</title>");
    return svg;
}

} // namespace

std::string draw(const Caption& caption, std::size_t height,
                 const std::function<std::string(const Canvas&)>& commands) {
    std::string html = "<figure>";
    for (const auto& canvas : canvases) {
        const auto name = caption.name + "_" + canvas.name;
        const auto begin =
            fmt::format(prologue, fmt::arg("width", canvas.width), fmt::arg("height", height),
                        fmt::arg("left", canvas.leftMargin), fmt::arg("name", name));
        html += inPage(runGnuplot(begin + commands(canvas)), name, caption.title, canvas.name);
    }
    return html + "</figure>\n";
}

} // namespace vantelhost
