#include "PlugIn.h"

#include <array>
#include <cstdlib>

#include <dlfcn.h>
#include <fmt/format.h>

#include "UsageError.h"

namespace vantelhost {

namespace {

void* load(const std::string& library) {
    void* handle = dlopen(library.c_str(), RTLD_NOW | RTLD_LOCAL);
    if (handle == nullptr) {
        throw UsageError(fmt::format("cannot load the plug-in: {}", dlerror()));
    }
    return handle;
}

/// Lets the plug-in size a buffer in this host's memory.
char* reallocate(char* buffer, std::size_t size) {
    return static_cast<char*>(std::realloc(buffer, size));
}

std::uint32_t checked(std::uint32_t version, const std::string& library) {
    if (version != ZEKELTR_API_VERSION) {
        throw UsageError(fmt::format("{} has API version {}, this host needs {}", library, version,
                                     ZEKELTR_API_VERSION));
    }
    return version;
}

} // namespace

void PlugIn::Unload::operator()(void* handle) const {
    dlclose(handle);
}

template <typename Function>
Function* PlugIn::find(const char* name) const {
    void* symbol = dlsym(handle_.get(), name);
    if (symbol == nullptr) {
        throw UsageError(fmt::format("{} is not a plug-in: it has no {}", library_, name));
    }
    return reinterpret_cast<Function*>(symbol);
}

// The version comes first: another version may have other functions.
PlugIn::PlugIn(const std::string& library)
    : library_(library),
      handle_(load(library)),
      apiVersion_(
          checked(find<decltype(zekeltr_getAPIVersion)>("zekeltr_getAPIVersion")(), library)),
      getName_(find<decltype(zekeltr_getName)>("zekeltr_getName")),
      getParameterValidationData_(
          find<decltype(zekeltr_getParameterValidationData)>("zekeltr_getParameterValidationData")),
      initialize_(find<decltype(zekeltr_initialize)>("zekeltr_initialize")),
      start_(find<decltype(zekeltr_start)>("zekeltr_start")),
      stop_(find<decltype(zekeltr_stop)>("zekeltr_stop")),
      finalize_(find<decltype(zekeltr_finalize)>("zekeltr_finalize")) {}

std::string PlugIn::name() const {
    std::array<char, ZEKELTR_NAME_SIZE + 1> buffer{};
    getName_(buffer.data());
    return buffer.data();
}

std::string PlugIn::schema(HostStatus& status) const {
    char* buffer = nullptr;
    getParameterValidationData_(reallocate, &buffer, status.get());
    const std::unique_ptr<char, decltype(&std::free)> owner(buffer, std::free);
    return buffer == nullptr || status.isError() ? std::string() : std::string(buffer);
}

void PlugIn::initialise(void** slot, const std::string& config, HostStatus& status) const {
    initialize_(slot, config.c_str(), status.get());
}

void PlugIn::start(void** slot, HostStatus& status) const {
    start_(slot, status.get());
}

void PlugIn::stop(void** slot) const {
    stop_(slot);
}

void PlugIn::finalise(void** slot) const {
    finalize_(slot);
}

} // namespace vantelhost
