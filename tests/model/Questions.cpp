#include "Questions.h"

#include <cstdlib>
#include <string>

#include "Promise.h"

namespace {

constexpr char noMemory[] =
    R"({"error_constant":"zeoskerr_memoryFull","file":"tPtp4lTimeRef","line":92,)"
    R"("component":"vantel_bc"})";

char* reallocateNothing(char* /*buffer*/, std::size_t /*size*/) {
    return nullptr;
}

char* reallocate(char* buffer, std::size_t size) {
    return static_cast<char*>(std::realloc(buffer, size));
}

} // namespace

void expectAnswers(const Plugin& plugin) {
    expect(plugin.getAPIVersion() == 2, "another version");
    char name[ZEKELTR_NAME_SIZE];
    plugin.getName(name);
    expect(std::string(name) == "IEEE 1588-2008 BC", "another name");
    char* schema = nullptr;
    HostStatus status;
    plugin.getParameterValidationData(&reallocate, &schema, &status);
    const std::string text = schema == nullptr ? "" : schema;
    std::free(schema);
    expectStatus(status, 0, "");
    expect(text.rfind('{', 0) == 0 && text.find("\"logSyncInterval\"") != std::string::npos,
           "no schema: " + text.substr(0, 100));
}

void expectRefusedAnswers(const Plugin& plugin) {
    char* schema = nullptr;
    HostStatus status;
    plugin.getParameterValidationData(&reallocateNothing, &schema, &status);
    expectStatus(status, -52000, noMemory);
    expect(schema == nullptr, "a schema without memory");
    HostStatus former(-7, ownError);
    plugin.getParameterValidationData(&reallocate, &schema, &former);
    expectStatus(former, -7, ownError);
    expect(schema == nullptr, "a schema in spite of an error on entry");
}

void expectStatus(const HostStatus& status, std::int32_t code, const std::string& text) {
    expect(status.code == code && status.text() == text,
           "a status of " + std::to_string(status.code) + " " + status.text() + " instead of " +
               std::to_string(code) + " " + text);
}
