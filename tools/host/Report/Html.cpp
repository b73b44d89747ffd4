#include "Report/Html.h"

#include <fmt/format.h>

#include "Text.h"

namespace vantelhost {

namespace {

std::string row(const Row& cells, const char* tag) {
    std::string html = "<tr>";
    for (const auto& cell : cells) {
        html += fmt::format("<{0}>{1}</{0}>", tag, escaped(cell));
    }
    return html + "</tr>\n";
}

} // namespace

std::string escaped(std::string_view text) {
    std::string html;
    for (const char character : onOneLine(text)) {
        switch (character) {
        case '&':
            html += "&amp;";
            break;
        case '<':
            html += "&lt;";
            break;
        case '>':
            html += "&gt;";
            break;
        case '"':
            html += "&quot;";
            break;
        case '\'':
            html += "&#39;";
            break;
        default:
            html += character;
        }
    }
    return html;
}

std::string paragraph(std::string_view text) {
    return fmt::format("<p>{}</p>\n", escaped(text));
}

std::string note(std::string_view text) {
    return fmt::format("<p class=\"note\">{}</p>\n", escaped(text));
}

std::string section(std::string_view title, std::string_view html) {
    return fmt::format("<section>\n<h2>{}</h2>\n{}</section>\n", escaped(title), html);
}

std::string table(const Row& head, const std::vector<Row>& rows) {
    std::string html = "<div class=\"table\"><table>\n";
    if (!head.empty()) {
        html += "<thead>" + row(head, "th") + "</thead>\n";
    }
    html += "<tbody>\n";
    for (const auto& each : rows) {
        html += row(each, "td");
    }
    return html + "</tbody>\n</table></div>\n";
}

} // namespace vantelhost
