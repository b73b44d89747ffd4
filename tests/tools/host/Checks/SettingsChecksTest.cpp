#include "Checks/SettingsChecks.h"

#include "Checks/CheckTest.h"

using namespace vantelhost;

TEST_F(CheckTest, InterfacesThatAreNamedOnceAreGood) {
    subject.interfaces = {"eth0", "eth1"};
    EXPECT_THAT(checkInterfaces(subject), says(Verdict::ok, "2, each named once"));
    subject.interfaces = {};
    EXPECT_THAT(checkInterfaces(subject), isGood());
}

TEST_F(CheckTest, AnInterfaceThatIsNamedTwiceFails) {
    subject.interfaces = {"eth0", "eth1", "eth0"};
    EXPECT_THAT(checkInterfaces(subject),
                says(Verdict::fail, "eth0 is named twice", "name each interface once"));
}

TEST_F(CheckTest, FollowUpInfoNeedsTheTransportOf8021AS) {
    (*subject.settings)["followUpInfo"] = true;
    for (const char* value : {"0x0", "0", "0x10", "0x3"}) {
        set("transportSpecific", value);
        EXPECT_THAT(checkFollowUpInfo(subject),
                    says(Verdict::warn,
                         "true, with transportSpecific " + std::string(value) +
                             ": ptp4l of linuxptp 4.4 and later drops the plug-in's requests",
                         "--set transportSpecific=0x1, as IEEE 802.1AS has it, or --set "
                         "followUpInfo=false"));
    }
    for (const char* value : {"0x1", "1", "0x2"}) {
        set("transportSpecific", value);
        EXPECT_THAT(checkFollowUpInfo(subject), isGood()) << value;
    }
}

TEST_F(CheckTest, WithoutFollowUpInfoAnyTransportIsGood) {
    (*subject.settings)["followUpInfo"] = false;
    set("transportSpecific", "0x0");
    EXPECT_THAT(checkFollowUpInfo(subject), says(Verdict::ok, "false"));
}

TEST_F(CheckTest, ADelayMechanismThatMeasuresNothingIsAWarning) {
    for (const char* value : {"NONE", "none"}) {
        set("delayMechanism", value);
        EXPECT_THAT(checkDelayMechanism(subject),
                    says(Verdict::warn, "no delay is measured, it would be part of every offset",
                         "--set delayMechanism=E2E or P2P"));
    }
    set("delayMechanism", "P2P");
    EXPECT_THAT(checkDelayMechanism(subject), says(Verdict::ok, "P2P"));
}

TEST_F(CheckTest, WithoutSettingsNoneIsChecked) {
    EXPECT_EQ(checkFollowUpInfo(subject).verdict, Verdict::skip);
    EXPECT_EQ(checkDelayMechanism(subject).verdict, Verdict::skip);
    subject.settings.reset();
    EXPECT_EQ(checkFollowUpInfo(subject).verdict, Verdict::skip);
    EXPECT_EQ(checkDelayMechanism(subject).verdict, Verdict::skip);
}
