#include "support/Markdown.h"

#include <sstream>

namespace markdown {
namespace {

std::string trimmed(const std::string& text) {
    const std::size_t begin = text.find_first_not_of(' ');
    return begin == std::string::npos ? ""
                                      : text.substr(begin, text.find_last_not_of(' ') - begin + 1);
}

Row cellsOf(const std::string& line) {
    Row cells;
    std::string cell;
    bool quoted = false;
    for (std::size_t at = 1; at < line.size(); ++at) {
        quoted = quoted != (line[at] == '`');
        if (line[at] == '|' && !quoted) {
            cells.push_back(trimmed(cell));
            cell.clear();
        } else {
            cell += line[at];
        }
    }
    return cells;
}

bool isTableLine(const std::string& line) {
    return line.compare(0, 1, "|") == 0;
}

} // namespace

std::vector<Row> tables(const std::string& document, const Row& heading) {
    std::vector<Row> rows;
    std::istringstream lines(document);
    for (std::string line; std::getline(lines, line);) {
        if (!isTableLine(line) || cellsOf(line) != heading) {
            continue;
        }
        std::getline(lines, line); // the rule below the heading
        while (std::getline(lines, line) && isTableLine(line)) {
            rows.push_back(cellsOf(line));
        }
    }
    return rows;
}

std::vector<Block> blocks(const std::string& document) {
    std::vector<Block> found;
    bool inside = false;
    std::istringstream lines(document);
    for (std::string line; std::getline(lines, line);) {
        if (line.compare(0, 3, "```") == 0) {
            if (!inside) {
                found.push_back({line.substr(3), ""});
            }
            inside = !inside;
        } else if (inside) {
            found.back().text += line + '\n';
        }
    }
    return found;
}

std::string unquoted(const std::string& cell) {
    const bool quoted = cell.size() > 2 && cell.front() == '`' && cell.back() == '`';
    return quoted ? cell.substr(1, cell.size() - 2) : cell;
}

} // namespace markdown
