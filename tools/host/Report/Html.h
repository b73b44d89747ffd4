/// @file
/// Parts of an HTML page. Texts are escaped here; what is called html is not.
#pragma once

#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace vantelhost {

/// The text as content or as the value of an attribute. Control characters become \xNN.
std::string escaped(std::string_view text);

std::string paragraph(std::string_view text);

/// A paragraph that must not be missed.
std::string note(std::string_view text);

std::string section(std::string_view title, std::string_view html);

/// What a colour stands for.
struct LegendEntry {
    unsigned colour; ///< red, green, blue
    std::string text;
};

std::string legend(const std::vector<LegendEntry>& entries);

using Row = std::vector<std::string>;

/// @param head the texts of the heading; may be empty
/// @param rows the texts of the cells
std::string table(const Row& head, const std::vector<Row>& rows);

/// Short texts, each below its name, side by side as far as there is space.
std::string definitions(const std::vector<std::pair<std::string, std::string>>& texts);

} // namespace vantelhost
