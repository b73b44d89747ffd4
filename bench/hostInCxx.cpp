// A host in C++ has had a thread, text and a failure before it loads anything.

#include <future>
#include <sstream>
#include <stdexcept>
#include <string>

extern "C" void use_language(void);

void use_language() {
    const auto thread = std::async(std::launch::async, [] {
        std::ostringstream text;
        text << 1.5 << std::to_string(2);
        throw std::runtime_error(text.str());
    });
    thread.wait();
}
