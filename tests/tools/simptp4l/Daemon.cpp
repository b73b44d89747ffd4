#include "Daemon.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <stdexcept>

#include "support/Processes.h"

namespace {

/// Writes configuration and script.
/// @return the command that runs the simulator with them
std::vector<std::string> prepare(const Folder& folder, const std::string& script,
                                 const std::vector<std::string>& interfaces,
                                 const std::string& config) {
    folder.write("config", "[global]\nuds_address " + folder.path("ptp4l") + "\n" + config);
    folder.write("config.sim", "log log\n" + script);
    std::vector<std::string> command{SIMPTP4L_PATH, "-f", folder.path("config")};
    for (const std::string& name : interfaces) {
        command.emplace_back("-i");
        command.push_back(name);
    }
    return command;
}

} // namespace

std::string readFile(const std::string& path) {
    std::ifstream file(path);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

Finished run(const std::vector<std::string>& arguments) {
    std::vector<std::string> command{SIMPTP4L_PATH};
    command.insert(command.end(), arguments.begin(), arguments.end());
    Child child(command);
    const int status = child.wait();
    return {status, child.output(), child.errors()};
}

Folder::Folder() {
    std::string name = std::filesystem::temp_directory_path() / "simptp4l.XXXXXX";
    if (mkdtemp(name.data()) == nullptr) {
        throw std::runtime_error("mkdtemp");
    }
    path_ = name;
}

Folder::~Folder() {
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
}

void Folder::write(const std::string& name, const std::string& text) const {
    std::ofstream(path(name)) << text;
}

Daemon::Daemon(const std::string& script, const std::vector<std::string>& interfaces,
               const std::string& config)
    : process(prepare(folder, script, interfaces, config), {"-i"}) {}

bool Daemon::isBound() const {
    return log().find("\"bound\"") != std::string::npos;
}

bool Daemon::waitUntilBound() const {
    return waitUntil([this] { return isBound(); });
}
