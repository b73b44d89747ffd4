/// @file
#pragma once

#include <sys/stat.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Checks/Finding.h"
#include "Checks/Subject.h"
#include "Tool.h"

/// A machine that the test makes: nothing of the real one is looked at.
class CheckTest : public testing::Test {
protected:
    CheckTest() {
        subject.daemon = folder.path("ptp4l");
        subject.socketPrefix = folder.path("ptp4lTimeRef.");
        subject.fifo = folder.path("fifo");
        subject.proc = folder.path("proc");
        subject.dev = folder.path("dev");
        subject.settings = vantelhost::Json{{"configFile", folder.path("ptp4l.conf")},
                                            {"udsAddress", folder.path("uds")},
                                            {"networkTransport", "UDPv4"}};
        ::mkdir(subject.proc.c_str(), 0755);
        ::mkdir(subject.dev.c_str(), 0755);
    }

    void set(const char* key, const std::string& value) { (*subject.settings)[key] = value; }

    const Folder folder;
    vantelhost::Subject subject;
};

inline testing::Matcher<const vantelhost::Finding&> isGood() {
    return testing::Field("verdict", &vantelhost::Finding::verdict, vantelhost::Verdict::ok);
}

/// @param found,mend parts of the texts
inline testing::Matcher<const vantelhost::Finding&>
says(vantelhost::Verdict verdict, const std::string& found, const std::string& mend = {}) {
    using vantelhost::Finding;
    return testing::AllOf(testing::Field("verdict", &Finding::verdict, verdict),
                          testing::Field("found", &Finding::found, testing::HasSubstr(found)),
                          testing::Field("mend", &Finding::mend, testing::HasSubstr(mend)));
}
