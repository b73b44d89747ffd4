#include "CommandLine.h"

#include <cstddef>
#include <cstring>

namespace simptp4l {
namespace {

class Reader {
public:
    explicit Reader(const std::vector<std::string>& arguments) : arguments_(arguments) {}

    CommandLine read() {
        while (next_ < arguments_.size() && line_.error.empty()) {
            const std::string word = arguments_[next_++];
            if (word.rfind("--", 0) == 0) {
                readLong(word.substr(2));
            } else if (word.size() > 1 && word[0] == '-') {
                readShort(word.substr(1));
            } else {
                line_.error = "unexpected argument: " + word;
            }
        }
        return line_;
    }

private:
    std::string value(const std::string& option) {
        if (next_ < arguments_.size()) {
            return arguments_[next_++];
        }
        line_.error = "option needs a value: " + option;
        return {};
    }

    void readLong(const std::string& text) {
        const std::size_t equals = text.find('=');
        const std::string name = text.substr(0, equals);
        if (name == "help" || name == "check") {
            (name == "help" ? line_.help : line_.check) = true;
            return;
        }
        const std::string given =
            equals == std::string::npos ? value("--" + name) : text.substr(equals + 1);
        if (name == "script") {
            line_.script = given;
        }
    }

    /// One word of short options: flags may be joined, a value may follow its letter directly.
    void readShort(const std::string& letters) {
        for (std::size_t at = 0; at < letters.size(); ++at) {
            const char letter = letters[at];
            if (std::strchr("fipl", letter) != nullptr) {
                const std::string rest = letters.substr(at + 1);
                setShort(letter, rest.empty() ? value(std::string("-") + letter) : rest);
                return;
            }
            if (letter == 'h') {
                line_.help = true;
            } else if (std::strchr("AEP246HSLsmqv", letter) == nullptr) {
                line_.error = std::string("unknown option: -") + letter;
            }
        }
    }

    void setShort(char letter, const std::string& text) {
        if (letter == 'f') {
            line_.config = text;
        } else if (letter == 'i') {
            line_.interfaces.push_back(text);
        }
    }

    const std::vector<std::string>& arguments_;
    std::size_t next_ = 0;
    CommandLine line_;
};

} // namespace

CommandLine readCommandLine(const std::vector<std::string>& arguments) {
    return Reader(arguments).read();
}

const char* helpText() {
    return "usage: simptp4l [-f CONFIG] [-i INTERFACE]... [--script FILE] [--check] [ptp4l "
           "options]\n"
           "\n"
           "A simulated ptp4l: answers management GETs on the uds_address of CONFIG.\n"
           "\n"
           "  -f CONFIG      ptp4l configuration file\n"
           "  -i INTERFACE   one port; may be repeated\n"
           "  --script FILE  what to simulate (default: CONFIG.sim, if it exists)\n"
           "  --check        only read CONFIG and script; status 0 when both are right\n"
           "  -h, --help     show this text\n"
           "\n"
           "Other options of ptp4l are accepted and ignored.\n";
}

} // namespace simptp4l
