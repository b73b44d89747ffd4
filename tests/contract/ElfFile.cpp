#include "ElfFile.h"

#include <cstring>
#include <stdexcept>

#include "support/TemporaryFolder.h"

namespace {

/// The symbol that a relocation refers to.
template <typename Relocation>
std::uint64_t symbolIndex(const Relocation& relocation) {
    return std::uint64_t{relocation.r_info} >> (sizeof(void*) == 8 ? 32 : 8);
}

} // namespace

ElfFile::ElfFile(const std::string& path) : path_(path), content_(readFile(path)) {
    const auto header = at<ElfW(Ehdr)>(0);
    if (std::memcmp(header.e_ident, ELFMAG, SELFMAG) != 0) {
        throw std::runtime_error(path);
    }
    for (unsigned index = 0; index < header.e_shnum; ++index) {
        sections_.push_back(at<ElfW(Shdr)>(header.e_shoff + index * sizeof(ElfW(Shdr))));
    }
}

std::vector<ElfFile::Symbol> ElfFile::symbols(std::uint32_t table) const {
    std::vector<Symbol> symbols;
    forEach<ElfW(Sym)>(table, [&](const ElfW(Sym) & record, const ElfW(Shdr) & section) {
        symbols.push_back(symbolOf(record, section));
    });
    return symbols;
}

std::set<std::string> ElfFile::dynamicNames(bool defined) const {
    std::set<std::string> names;
    for (const Symbol& symbol : symbols(SHT_DYNSYM)) {
        if (symbol.binding != STB_LOCAL && symbol.isDefined() == defined) {
            names.insert(symbol.name);
        }
    }
    return names;
}

std::set<std::string> ElfFile::dynamicTexts(std::int64_t tag) const {
    std::set<std::string> texts;
    forEach<ElfW(Dyn)>(SHT_DYNAMIC, [&](const ElfW(Dyn) & entry, const ElfW(Shdr) & section) {
        if (entry.d_tag == tag) {
            const std::uint64_t strings = sections_.at(section.sh_link).sh_offset;
            texts.insert(content_.c_str() + strings + entry.d_un.d_val);
        }
    });
    return texts;
}

std::optional<std::uint64_t> ElfFile::dynamicValue(std::int64_t tag) const {
    std::optional<std::uint64_t> value;
    forEach<ElfW(Dyn)>(SHT_DYNAMIC, [&](const ElfW(Dyn) & entry, const ElfW(Shdr)&) {
        if (entry.d_tag == tag) {
            value = entry.d_un.d_val;
        }
    });
    return value;
}

std::optional<std::uint32_t> ElfFile::segmentFlags(std::uint32_t type) const {
    const auto header = at<ElfW(Ehdr)>(0);
    for (unsigned index = 0; index < header.e_phnum; ++index) {
        const auto segment = at<ElfW(Phdr)>(header.e_phoff + index * sizeof(ElfW(Phdr)));
        if (segment.p_type == type) {
            return segment.p_flags;
        }
    }
    return std::nullopt;
}

std::map<std::uint64_t, std::string> ElfFile::references(const Symbol& symbol) const {
    std::map<std::uint64_t, std::string> references;
    const auto visit = [&](const auto& relocation, const ElfW(Shdr) & section) {
        const std::uint64_t offset = relocation.r_offset - symbol.value;
        if (section.sh_info == symbol.section && offset < symbol.size) {
            const ElfW(Shdr)& table = sections_.at(section.sh_link);
            const std::uint64_t record =
                table.sh_offset + symbolIndex(relocation) * sizeof(ElfW(Sym));
            references[offset] = symbolOf(at<ElfW(Sym)>(record), table).name;
        }
    };
    forEach<ElfW(Rela)>(SHT_RELA, visit);
    forEach<ElfW(Rel)>(SHT_REL, visit);
    return references;
}

template <typename Record>
Record ElfFile::at(std::uint64_t offset) const {
    Record record{};
    if (offset > content_.size() || content_.size() - offset < sizeof(record)) {
        throw std::runtime_error(path_);
    }
    std::memcpy(&record, content_.data() + offset, sizeof(record));
    return record;
}

template <typename Record, typename Visitor>
void ElfFile::forEach(std::uint32_t type, Visitor visit) const {
    for (const ElfW(Shdr) & section : sections_) {
        for (std::uint64_t offset = 0; section.sh_type == type && offset < section.sh_size;
             offset += sizeof(Record)) {
            visit(at<Record>(section.sh_offset + offset), section);
        }
    }
}

ElfFile::Symbol ElfFile::symbolOf(const ElfW(Sym) & record, const ElfW(Shdr) & table) const {
    const std::uint64_t strings = sections_.at(table.sh_link).sh_offset;
    return {content_.c_str() + strings + record.st_name,
            record.st_info & 0xfU,
            static_cast<unsigned>(record.st_info) >> 4U,
            record.st_shndx,
            record.st_value,
            record.st_size};
}
