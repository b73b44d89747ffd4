#include "errors/JsonScanner.h"

namespace zeerr {
namespace {

constexpr int deepest = 1000;

class Scanner {
public:
    explicit Scanner(std::string_view text) : rest_(text) {}

    std::string_view rest() const { return rest_; }

    /// @return false when the text does not go on with an object or array that scans. The rest then
    ///         begins anywhere, otherwise behind the closing bracket.
    bool container(int depth) {
        const bool named = take('{');
        return (named || take('[')) && depth <= deepest &&
               elements(named ? '}' : ']', depth, named);
    }

private:
    bool elements(char close, int depth, bool named) {
        if (take(close)) {
            return true;
        }
        do {
            if (named && !(string() && take(':'))) {
                return false;
            }
            if (!value(depth)) {
                return false;
            }
        } while (take(','));
        return take(close);
    }

    bool value(int depth) {
        skipBlanks();
        const char first = rest_.empty() ? '\0' : rest_.front();
        if (first == '{' || first == '[') {
            return container(depth + 1);
        }
        return first == '"' ? string() : word();
    }

    bool string() {
        if (!take('"')) {
            return false;
        }
        for (std::size_t i = 0; i < rest_.size(); ++i) {
            if (rest_[i] == '"') {
                rest_.remove_prefix(i + 1);
                return true;
            }
            if (rest_[i] == '\\') {
                ++i;
            }
        }
        return false;
    }

    /// A number, which is not looked at closely, or one of the three names.
    bool word() {
        const std::size_t length = rest_.find_first_not_of("+-.0123456789Eaeflnrstu");
        const std::string_view token = rest_.substr(0, length);
        rest_.remove_prefix(token.size());
        return token == "true" || token == "false" || token == "null" ||
               (!token.empty() && (token.front() == '-' || isDigit(token.front())));
    }

    static bool isDigit(char character) { return character >= '0' && character <= '9'; }

    bool take(char character) {
        skipBlanks();
        if (rest_.empty() || rest_.front() != character) {
            return false;
        }
        rest_.remove_prefix(1);
        return true;
    }

    void skipBlanks() {
        while (!rest_.empty() && isJsonBlank(rest_.front())) {
            rest_.remove_prefix(1);
        }
    }

    std::string_view rest_;
};

} // namespace

const char* closingBracket(std::string_view text) {
    Scanner scanner(text);
    return scanner.container(1) ? scanner.rest().data() - 1 : nullptr;
}

} // namespace zeerr
