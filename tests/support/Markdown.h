/// @file
/// What a document of the project shows, for tests that keep it in step with what it describes.
#pragma once

#include <string>
#include <vector>

namespace markdown {

/// The cells of a row of a table, without the blanks around them.
using Row = std::vector<std::string>;

/// A fenced block.
struct Block {
    std::string language; ///< the word behind the opening fence, or ""
    std::string text;
};

/// The rows of all tables that have this heading row, without it.
std::vector<Row> tables(const std::string& document, const Row& heading);

std::vector<Block> blocks(const std::string& document);

/// A cell that stands between backquotes, without them; any other as it is.
std::string unquoted(const std::string& cell);

} // namespace markdown
