// Keeps docs/abi.txt in step with what was built.

#include <cstdint>
#include <set>
#include <sstream>
#include <string>
#include <type_traits>

#include <gtest/gtest.h>

#include <vantel_bc/zekel.h>
#include <vantel_bc/zekeltr.h>

#include "AbiDescription.h"
#include "ElfFile.h"
#include "support/TemporaryFolder.h"

namespace {

// What the names of C functions do not tell.
template <typename Function, typename Expected>
constexpr bool is = std::is_same_v<Function, Expected>;
using Reallocate = char* (*)(char*, std::size_t);
static_assert(is<decltype(zekeltr_getAPIVersion), std::uint32_t()>);
static_assert(is<decltype(zekeltr_initialize), void(void**, const char*, zeerr_Status*)>);
static_assert(is<decltype(zekeltr_finalize), void(void**)>);
static_assert(is<decltype(zekeltr_start), void(void**, zeerr_Status*)>);
static_assert(is<decltype(zekeltr_stop), void(void**)>);
static_assert(is<decltype(zekeltr_getName), void(char*)>);
static_assert(
    is<decltype(zekeltr_getParameterValidationData), void(Reallocate, char**, zeerr_Status*)>);
static_assert(is<decltype(zekel_getTime), void(void**, std::uint64_t*, zeerr_Status*)>);
static_assert(
    is<decltype(zekel_adjustTime), void(void**, std::uint64_t, std::uint64_t, zeerr_Status*)>);
static_assert(
    is<decltype(zekel_setTRQuality), void(void**, const double*, const char*, zeerr_Status*)>);
static_assert(is<decltype(zekel_updateMetaData), void(void**, const char*, zeerr_Status*)>);

static_assert(std::is_same_v<zeerr_Status, zeerr::Status>, "one record, two names");
static_assert(std::is_standard_layout_v<zeerr::Status>, "as C lays it out");
static_assert(std::is_trivial_v<zeerr::Status>, "a plain record");
static_assert(is<decltype(zeerr::Status::code), std::int32_t>);
static_assert(is<decltype(zeerr::Status::capacity), std::uint32_t>);
static_assert(is<decltype(zeerr::Status::resize), bool (*)(zeerr::Status*, std::uint32_t)>);
static_assert(is<decltype(zeerr::Status::json), char*>);

/// The indented lines of a description, each behind its heading.
std::set<std::string> entriesOf(const std::string& description) {
    std::set<std::string> entries;
    std::istringstream lines(description);
    std::string heading;
    for (std::string line; std::getline(lines, line);) {
        if (line.compare(0, 2, "  ") == 0) {
            entries.insert(heading + " >" + line.substr(1) + '\n');
        } else {
            heading = line;
        }
    }
    return entries;
}

void listDifference(std::ostream& out, const char* mark, const std::string& of,
                    const std::string& to) {
    const auto others = entriesOf(to);
    for (const std::string& entry : entriesOf(of)) {
        out << (others.count(entry) == 0 ? mark + entry : "");
    }
}

TEST(AbiTest, IsAsDescribed) {
    const std::string promised = readFile(VANTEL_PROJECT_FOLDER "/docs/abi.txt");
    const std::string built = describeAbi(VANTEL_BC_LIBRARY, readFile(VANTEL_BC_OBJECTS));
    writeFile(VANTEL_ABI_OUTPUT, built);
    std::ostringstream changes;
    listDifference(changes, "- ", promised, built);
    listDifference(changes, "+ ", built, promised);
    EXPECT_TRUE(built == promised) << "The binary interface has changed:\n"
                                   << changes.str()
                                   << "\"-\" is what docs/abi.txt promises, \"+\" what was built. "
                                      "Hosts that were built before "
                                      "may break.\nIf it is meant, run 'scripts/abi.sh --update', "
                                      "commit docs/abi.txt, and say "
                                      "so in CHANGELOG.md.";
}

TEST(AbiTest, LogIsNeitherOpenedNorClosed) {
    const std::set<std::string> imported = ElfFile(VANTEL_BC_LIBRARY).dynamicNames(false);
    EXPECT_EQ(imported.count("openlog"), 0U);
    EXPECT_EQ(imported.count("closelog"), 0U);
    EXPECT_EQ(imported.count("setlogmask"), 0U);
    EXPECT_EQ(imported.count("syslog") + imported.count("__syslog_chk") +
                  imported.count("__vsyslog_chk"),
              1U);
}

} // namespace
