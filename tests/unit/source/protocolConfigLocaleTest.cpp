#include "protocolConfig.h"

#include <cctype>
#include <clocale>
#include <cstdlib>
#include <optional>

#include <endian.h>
#include <gtest/gtest.h>
#include <locale.h>

#include "ProtocolConfigFixture.h"

namespace {

/// The value of an environment variable while it lives.
class Environment {
public:
    Environment(const char* name, const std::string& value) : name_(name) {
        if (const char* const former = std::getenv(name)) {
            former_ = former;
        }
        setenv(name, value.c_str(), 1);
    }
    ~Environment() { former_ ? setenv(name_, former_->c_str(), 1) : unsetenv(name_); }
    Environment(const Environment&) = delete;
    Environment& operator=(const Environment&) = delete;

private:
    const char* name_;
    std::optional<std::string> former_;
};

/// The locale of a host: of its environment and process, and then of the thread as well.
class ProtocolConfigLocaleTest : public ProtocolConfigFixture {
protected:
    ~ProtocolConfigLocaleTest() override {
        uselocale(LC_GLOBAL_LOCALE);
        std::setlocale(LC_ALL, "C");
        if (ofThread != nullptr) {
            freelocale(ofThread);
        }
    }

    /// Compiles a locale in the working folder where it is not installed. @return whether it is
    /// set.
    bool setLocale(const std::string& language, const std::string& characters) {
        const std::string name = language + "." + characters;
        if (std::setlocale(LC_ALL, name.c_str()) == nullptr) {
            // The C library keeps in mind what it did not find in a folder: so compile, then look.
            // What it compiles is of one byte order.
            const std::string order = htobe16(1) == 1 ? "--big-endian" : "--little-endian";
            const std::string command = "localedef " + order + " -c -i " + language + " -f " +
                                        characters + " '" + folder.path(name) +
                                        "' >localedef.log 2>&1";
            if (std::system(command.c_str()) != 0) {
                return false;
            }
            const Environment path("LOCPATH", folder.path());
            if (std::setlocale(LC_ALL, name.c_str()) == nullptr) {
                return false;
            }
        }
        ofThread = duplocale(LC_GLOBAL_LOCALE);
        language_.emplace("LC_ALL", name);
        return true;
    }

    void expectLine(const std::string& line) {
        EXPECT_TRUE(writtenHasLine(line)) << line;
        writeFile("ptp4l_bc.conf", "");
    }

    locale_t ofThread = nullptr;

private:
    std::optional<Environment> language_;
};

constexpr char noLocaledef[] = "the locale is not installed, and localedef cannot make it";

TEST_F(ProtocolConfigLocaleTest, CommaAsDecimalPointChangesNothing) {
    if (!setLocale("de_DE", "UTF-8")) {
        GTEST_SKIP() << noLocaledef;
    }
    ASSERT_STREQ(std::localeconv()->decimal_point, ",");
    set("priority1", "12.9");
    read();
    EXPECT_TRUE(writtenHasLine("neighborPropDelayThresh 20000000"));
    EXPECT_TRUE(writtenHasLine("priority1               12"));
}

TEST_F(ProtocolConfigLocaleTest, DecimalPointOfSeveralOctetsChangesNothing) {
    if (!setLocale("ps_AF", "UTF-8")) {
        GTEST_SKIP() << noLocaledef;
    }
    ASSERT_STREQ(std::localeconv()->decimal_point, "\xd9\xab");
    set("priority1", "12.9");
    set("priority2", "-12.9e1");
    read();
    EXPECT_TRUE(writtenHasLine("priority2               -129"));
    expectLine("priority1               12");
    uselocale(ofThread);
    read();
    EXPECT_TRUE(writtenHasLine("neighborPropDelayThresh 20000000"));
    expectLine("priority1               12");
}

TEST_F(ProtocolConfigLocaleTest, CapitalIWithADotlessSmallOneIsStillFound) {
    if (!setLocale("tr_TR", "ISO-8859-9")) {
        GTEST_SKIP() << noLocaledef;
    }
    ASSERT_EQ(std::tolower('I'), 0xfd);
    for (const char* const key : {"interface", "priority1", "configFile", "transportSpecific"}) {
        remove(key);
    }
    set("INTERFACE", "[\"eth2\"]");
    set("PRIORITY1", "12.9");
    set("CONFIGFILE", "\"ptp4l_bc.conf\"");
    set("TRANSPORTSPECIFIC", "\"0x1F\"");
    read();
    EXPECT_EQ(session.interfaces, std::vector<std::string>{"eth2"});
    EXPECT_EQ(session.transportSpecific, 31);
    expectLine("priority1               12");
    session.interfaces.clear();
    uselocale(ofThread);
    read();
    EXPECT_EQ(session.interfaces, std::vector<std::string>{"eth2"});
    expectLine("priority1               12");
}

TEST_F(ProtocolConfigLocaleTest, FailuresNameTheSameKeysAndNumbers) {
    if (!setLocale("ps_AF", "UTF-8")) {
        GTEST_SKIP() << noLocaledef;
    }
    set("priority1", "12.5");
    set("priority2", "\"x\"");
    readToFailure();
    EXPECT_EQ(status.code, -52004);
    const std::string json = status.json;
    EXPECT_NE(json.find(R"("error_constant":"errCode","file":"jsonHelperFunctions","line":50,)"),
              std::string::npos);
    EXPECT_NE(json.find(R"(\"priority1\":12.5,)"), std::string::npos);
    EXPECT_NE(json.find(R"(,"key":"priority2"}})"), std::string::npos);
}

TEST_F(ProtocolConfigLocaleTest, LocaleOfTheThreadIsTheHostsAgain) {
    ofThread = duplocale(LC_GLOBAL_LOCALE);
    read();
    EXPECT_EQ(uselocale(nullptr), LC_GLOBAL_LOCALE);
    uselocale(ofThread);
    read();
    EXPECT_EQ(uselocale(nullptr), ofThread);
}

TEST_F(ProtocolConfigLocaleTest, LocaleOfTheThreadIsTheHostsAgainAfterAFailure) {
    ofThread = duplocale(LC_GLOBAL_LOCALE);
    const std::string whole = text();
    remove("interface");
    const std::string withoutInterface = text();
    set("interface", "[1]");
    const std::string noName = text();
    set("interface", "[]");
    set("priority1", "1e300");
    for (const std::string& configText : {std::string("{"), withoutInterface, noName, text()}) {
        uselocale(LC_GLOBAL_LOCALE);
        readToFailure(configText);
        EXPECT_EQ(uselocale(nullptr), LC_GLOBAL_LOCALE) << configText;
        uselocale(ofThread);
        readToFailure(configText);
        EXPECT_EQ(uselocale(nullptr), ofThread) << configText;
    }
    zekelVantel::readProtocolConfig(session, whole);
    EXPECT_EQ(uselocale(nullptr), ofThread);
}

} // namespace
