/// @file
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include <elf.h>
#include <link.h>

/// A library or an object of the kind that this program is, read from its file.
class ElfFile {
public:
    struct Symbol {
        std::string name;
        unsigned type; ///< STT_FUNC, ...
        unsigned binding;
        unsigned section; ///< SHN_UNDEF, when it is another file's
        std::uint64_t value;
        std::uint64_t size;

        bool isDefined() const { return section != SHN_UNDEF; }
    };

    /// @throws std::runtime_error when it cannot be read as such a file.
    explicit ElfFile(const std::string& path);

    /// @param table SHT_DYNSYM or SHT_SYMTAB.
    std::vector<Symbol> symbols(std::uint32_t table) const;

    /// The names that the loader sees: those that others define, or those that this file does.
    std::set<std::string> dynamicNames(bool defined) const;

    std::set<std::string> dynamicTexts(std::int64_t tag) const;
    std::optional<std::uint64_t> dynamicValue(std::int64_t tag) const;

    /// The flags of the first segment of a type.
    std::optional<std::uint32_t> segmentFlags(std::uint32_t type) const;

    /// What an object's symbol refers to, by the offset within it.
    std::map<std::uint64_t, std::string> references(const Symbol& symbol) const;

private:
    template <typename Record>
    Record at(std::uint64_t offset) const;

    template <typename Record, typename Visitor>
    void forEach(std::uint32_t type, Visitor visit) const;

    Symbol symbolOf(const ElfW(Sym) & record, const ElfW(Shdr) & table) const;

    std::string path_;
    std::string content_;
    std::vector<ElfW(Shdr)> sections_;
};
