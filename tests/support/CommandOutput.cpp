#include "support/CommandOutput.h"

#include <array>
#include <cstdio>
#include <memory>

std::string outputOf(const std::string& command) {
    // NOLINTNEXTLINE(cert-env33-c): a command of a shell is what it is for
    const std::unique_ptr<FILE, int (*)(FILE*)> pipe(popen(command.c_str(), "re"), &pclose);
    std::string output;
    std::array<char, 4096> piece{};
    while (pipe && std::fgets(piece.data(), piece.size(), pipe.get()) != nullptr) {
        output += piece.data();
    }
    return output;
}
