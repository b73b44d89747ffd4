#include "Report/Html.h"

#include <fmt/format.h>

#include "Text.h"

namespace vantelhost {

namespace {

/// The word, which may be broken only where its parts end. Short ones stay whole.
std::string breakable(std::string_view word) {
    constexpr std::size_t shortest = 24;
    if (word.size() < shortest) {
        return escaped(word);
    }
    std::string html;
    while (!word.empty()) {
        const auto end = word.find_first_of("/,:_");
        const auto part = word.substr(0, end == std::string_view::npos ? end : end + 1);
        word.remove_prefix(part.size());
        html += escaped(part) + (word.empty() ? "" : "<wbr />");
    }
    return html;
}

std::string cellText(std::string_view text) {
    std::string html;
    for (auto end = text.find(' '); end != std::string_view::npos; end = text.find(' ')) {
        html += breakable(text.substr(0, end)) + " ";
        text.remove_prefix(end + 1);
    }
    return html + breakable(text);
}

std::string row(const Row& cells, const char* tag) {
    std::string html = "<tr>";
    for (const auto& cell : cells) {
        html += fmt::format("<{0}>{1}</{0}>", tag, cellText(cell));
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

std::string legend(const std::vector<LegendEntry>& entries) {
    std::string html = "<ul class=\"legend\">\n";
    for (const auto& [colour, text] : entries) {
        html += fmt::format("<li><span style=\"background:#{:06x}\"></span>{}</li>\n", colour,
                            escaped(text));
    }
    return html + "</ul>\n";
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

std::string definitions(const std::vector<std::pair<std::string, std::string>>& texts) {
    std::string html = "<dl>\n";
    for (const auto& [name, text] : texts) {
        html += fmt::format("<div><dt>{}</dt><dd>{}</dd></div>\n", escaped(name), escaped(text));
    }
    return html + "</dl>\n";
}

} // namespace vantelhost
