#include "AbiDescription.h"

#include <algorithm>
#include <cstddef>
#include <cstdlib>
#include <map>
#include <memory>
#include <regex>
#include <set>
#include <sstream>
#include <vector>

#include <cxxabi.h>

#include <vantel_bc/status.h>

#include "ElfFile.h"

namespace {

/// Which of them there are depends on compiler and machine: the loader, the mathematics of the C
/// library, and what sanitizers add.
bool isOfTheToolchain(const std::string& name) {
    static const std::regex pattern("(ld-linux.*|ld64|libm|lib[a-z]+san)\\.so\\..*");
    return std::regex_match(name, pattern);
}

void describeFile(std::ostream& out, const ElfFile& library) {
    out << "Shared object\n";
    for (const std::string& name : library.dynamicTexts(DT_SONAME)) {
        out << "  is named " << name << '\n';
    }
    for (const std::string& name : library.dynamicTexts(DT_NEEDED)) {
        if (!isOfTheToolchain(name)) {
            out << "  needs " << name << '\n';
        }
    }
    const bool hasRunPath =
        !library.dynamicTexts(DT_RPATH).empty() || !library.dynamicTexts(DT_RUNPATH).empty();
    const bool bindsNow = (library.dynamicValue(DT_FLAGS).value_or(0) & DF_BIND_NOW) != 0;
    const bool writesToCode = library.dynamicValue(DT_TEXTREL).has_value() ||
                              (library.dynamicValue(DT_FLAGS).value_or(0) & DF_TEXTREL) != 0;
    const bool runsOnStack = (library.segmentFlags(PT_GNU_STACK).value_or(PF_X) & PF_X) != 0;
    const bool protects = library.segmentFlags(PT_GNU_RELRO).has_value();
    out << "  symbol versions: " << library.dynamicValue(DT_VERDEFNUM).value_or(0) << '\n'
        << "  search path of its own: " << (hasRunPath ? "yes" : "no") << '\n'
        << "  executable stack: " << (runsOnStack ? "yes" : "no") << '\n'
        << "  relocations in code: " << (writesToCode ? "yes" : "no") << '\n'
        << "  read-only after relocation: " << (protects ? "yes" : "no") << '\n'
        << "  all symbols bound when loaded: " << (bindsNow ? "yes" : "no") << '\n';
}

void describeSymbols(std::ostream& out, const ElfFile& library) {
    std::set<std::string> exported;
    for (const ElfFile::Symbol& symbol : library.symbols(SHT_DYNSYM)) {
        if (symbol.binding != STB_LOCAL && symbol.isDefined()) {
            exported.insert(symbol.type == STT_FUNC ? "function " + symbol.name
                                                    : "data " + symbol.name + ", " +
                                                          std::to_string(symbol.size) + " octets");
        }
    }
    out << "\nExports\n";
    for (const std::string& line : exported) {
        out << "  " << line << '\n';
    }
    out << "\nTakes from the host\n";
    for (const std::string& name : library.dynamicNames(false)) {
        if (name.compare(0, 5, "zekel") == 0) {
            out << "  " << name << '\n';
        }
    }
}

/// Writes a distance for 32-bit and for 64-bit pointers.
/// @param pointers how many pointers are part of it.
void describeDistance(std::ostream& out, const char* name, std::size_t octets,
                      std::size_t pointers) {
    const std::size_t rest = octets - pointers * sizeof(void*);
    out << "  " << name << ' ' << rest + pointers * 4 << ' ' << rest + pointers * 8 << '\n';
}

void describeStatus(std::ostream& out) {
    out << "\nzeerr::Status, in octets: with 32-bit pointers, with 64-bit pointers\n";
    describeDistance(out, "code: signed 32-bit, at", offsetof(zeerr_Status, code), 0);
    describeDistance(out, "capacity: unsigned 32-bit, at", offsetof(zeerr_Status, capacity), 0);
    describeDistance(out, "resize: pointer, at", offsetof(zeerr_Status, resize), 0);
    describeDistance(out, "json: pointer, at", offsetof(zeerr_Status, json), 1);
    describeDistance(out, "size", sizeof(zeerr_Status), 2);
    describeDistance(out, "alignment", alignof(zeerr_Status), 1);
}

std::string demangled(const std::string& name) {
    int result = 0;
    const std::unique_ptr<char, decltype(&std::free)> text(
        abi::__cxa_demangle(name.c_str(), nullptr, nullptr, &result), &std::free);
    return text == nullptr ? name : text.get();
}

/// A function without its class: whoever calls through a slot does not care whose it is.
std::string slotText(const std::string& mangled) {
    static const std::regex destructor(".*D([012])Ev");
    std::smatch kind;
    if (std::regex_match(mangled, kind, destructor)) {
        return kind[1] == "0" ? "destructor, deleting" : "destructor, complete";
    }
    const std::string text = demangled(mangled);
    const std::size_t before = text.rfind("::", text.find('('));
    return before == std::string::npos ? text : text.substr(before + 2);
}

/// The class of "vtable for CLASS" or "typeinfo for CLASS".
std::string className(const std::string& mangled) {
    const std::string text = demangled(mangled);
    return text.substr(text.find(" for ") + 5);
}

bool isTypeInfo(const std::string& mangled) {
    return mangled.compare(0, 4, "_ZTI") == 0;
}

using References = std::map<std::uint64_t, std::string>;

bool refersTo(const References& references, const std::string& name) {
    return std::any_of(references.begin(), references.end(),
                       [&](const auto& reference) { return reference.second == name; });
}

/// The slots behind the first type information: the table that pointers to the class use.
std::vector<std::string> slotsOf(const References& table) {
    std::vector<std::string> slots;
    auto entry = std::find_if(table.begin(), table.end(),
                              [](const auto& candidate) { return isTypeInfo(candidate.second); });
    while (entry != table.end()) {
        const std::uint64_t next = entry->first + sizeof(void*);
        entry = table.find(next);
        if (entry != table.end()) {
            slots.push_back(slotText(entry->second));
        }
    }
    return slots;
}

/// Whether it is the table or the type information of a class of this project.
bool isOurs(const std::string& mangled) {
    static const std::regex ours("_ZT[VI]N(11zekelVantel|5zeerr)[0-9]+[A-Za-z0-9]+E");
    return mangled.compare(0, 3, "_ZT") == 0 && std::regex_match(mangled, ours);
}

using Classes = std::map<std::string, std::vector<std::string>>;

/// Adds the slots, and the direct bases, of the classes with virtual functions.
void addClasses(const ElfFile& object, Classes& slots, Classes& bases) {
    for (const ElfFile::Symbol& symbol : object.symbols(SHT_SYMTAB)) {
        if (!symbol.isDefined() || !isOurs(symbol.name)) {
            continue;
        }
        const auto references = object.references(symbol);
        if (!isTypeInfo(symbol.name)) {
            // Tables of abstract classes are there with some compilers only.
            if (!refersTo(references, "__cxa_pure_virtual")) {
                slots[className(symbol.name)] = slotsOf(references);
            }
            continue;
        }
        auto& list = bases[className(symbol.name)];
        list.clear();
        for (const auto& [offset, name] : references) {
            if (isTypeInfo(name)) {
                list.push_back(className(name));
            }
        }
    }
}

void describeClasses(std::ostream& out, const std::string& objects) {
    Classes slots;
    Classes bases;
    std::istringstream paths(objects);
    for (std::string path; std::getline(paths, path);) {
        addClasses(ElfFile(path), slots, bases);
    }
    out << "\nVirtual functions by slot. A class without a table of its own has the first slots "
           "of\n"
           "the classes that derive from it.\n";
    for (const auto& [name, functions] : slots) {
        out << '\n' << name;
        for (const std::string& base : bases[name]) {
            out << (&base == &bases[name].front() ? ": " : ", ") << base;
        }
        out << '\n';
        for (std::size_t slot = 0; slot < functions.size(); ++slot) {
            out << "  " << slot << ' ' << functions[slot] << '\n';
        }
    }
}

} // namespace

std::string describeAbi(const std::string& library, const std::string& objects) {
    const ElfFile file(library);
    std::ostringstream text;
    describeFile(text, file);
    describeSymbols(text, file);
    describeStatus(text);
    describeClasses(text, objects);
    return text.str();
}
