#include <cstring>
#include <set>
#include <stdexcept>
#include <string>
#include <vector>

#include <elf.h>
#include <link.h>

#include <gtest/gtest.h>

#include "support/TemporaryFolder.h"

namespace {

using Names = std::set<std::string>;

/// The dynamic symbols of a library of this machine's kind, read from its file.
class ElfFile {
public:
    explicit ElfFile(const std::string& path) : content_(readFile(path)) {
        const auto header = at<ElfW(Ehdr)>(0);
        if (std::memcmp(header.e_ident, ELFMAG, SELFMAG) != 0) {
            throw std::runtime_error(path);
        }
        for (unsigned index = 0; index < header.e_shnum; ++index) {
            sections_.push_back(at<ElfW(Shdr)>(header.e_shoff + index * sizeof(ElfW(Shdr))));
        }
    }

    Names symbols(bool defined) const {
        Names names;
        forEach<ElfW(Sym)>(SHT_DYNSYM, [&](const ElfW(Sym) & symbol, std::size_t strings) {
            const bool local = symbol.st_info >> 4 == STB_LOCAL;
            if (!local && (symbol.st_shndx != SHN_UNDEF) == defined) {
                names.insert(text(strings + symbol.st_name));
            }
        });
        return names;
    }

    Names dynamicTexts(std::int64_t tag) const {
        Names names;
        forEach<ElfW(Dyn)>(SHT_DYNAMIC, [&](const ElfW(Dyn) & entry, std::size_t strings) {
            if (entry.d_tag == tag) {
                names.insert(text(strings + entry.d_un.d_val));
            }
        });
        return names;
    }

private:
    template <typename Record>
    Record at(std::size_t offset) const {
        Record record{};
        std::memcpy(&record, content_.substr(offset, sizeof(record)).data(), sizeof(record));
        return record;
    }

    template <typename Record, typename Visitor>
    void forEach(std::uint32_t type, Visitor visit) const {
        for (const auto& section : sections_) {
            if (section.sh_type == type) {
                const std::size_t strings = sections_.at(section.sh_link).sh_offset;
                for (std::size_t at0 = 0; at0 < section.sh_size; at0 += sizeof(Record)) {
                    visit(at<Record>(section.sh_offset + at0), strings);
                }
            }
        }
    }

    std::string text(std::size_t offset) const { return content_.c_str() + offset; }

    std::string content_;
    std::vector<ElfW(Shdr)> sections_;
};

const ElfFile& library() {
    static const ElfFile file(VANTEL_BC_LIBRARY);
    return file;
}

TEST(ExportedSymbolsTest, AreExactlyTheSevenFunctions) {
    EXPECT_EQ(library().symbols(true),
              (Names{"zekeltr_finalize", "zekeltr_getAPIVersion", "zekeltr_getName",
                     "zekeltr_getParameterValidationData", "zekeltr_initialize", "zekeltr_start",
                     "zekeltr_stop"}));
}

TEST(ExportedSymbolsTest, FourAreLeftForTheHost) {
    Names ofTheHost;
    for (const std::string& name : library().symbols(false)) {
        if (name.compare(0, 5, "zekel") == 0) {
            ofTheHost.insert(name);
        }
    }
    EXPECT_EQ(ofTheHost, (Names{"zekel_adjustTime", "zekel_getTime", "zekel_setTRQuality",
                                "zekel_updateMetaData"}));
}

TEST(ExportedSymbolsTest, LogIsNeitherOpenedNorClosed) {
    const Names imported = library().symbols(false);
    EXPECT_EQ(imported.count("openlog"), 0U);
    EXPECT_EQ(imported.count("closelog"), 0U);
    EXPECT_EQ(imported.count("setlogmask"), 0U);
    EXPECT_EQ(imported.count("syslog") + imported.count("__syslog_chk"), 1U);
}

TEST(ExportedSymbolsTest, SharedObjectNameHasVersion19) {
    EXPECT_EQ(library().dynamicTexts(DT_SONAME), Names{"libvantel_bc.so.19"});
}

} // namespace
