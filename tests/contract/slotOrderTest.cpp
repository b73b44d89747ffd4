// The order of the virtual functions, as callers that were compiled apart rely on it. The
// destructor takes the first two slots: complete, and deleting.

#include <cstdlib>
#include <memory>
#include <string>
#include <type_traits>
#include <typeinfo>

#include <cxxabi.h>

#include <gtest/gtest.h>

#include "errors/Exception.h"
#include "iMsgInterface.h"
#include "support/VirtualSlots.h"
#include "tGetDataFromPtp4l.h"
#include "tMsgBuffer.h"
#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lMetaData.h"
#include "tPtp4lParentDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetNpMgmtTlv.h"
#include "tPtp4lPortPropertiesMgmtTlv.h"
#include "tPtp4lTimeRef.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tPtpMgmtMsg.h"
#include "tPtpMgmtNode.h"
#include "tPtpText.h"
#include "tUdsMsgInterface.h"

using namespace zekelVantel;

namespace {

constexpr std::size_t destructors = 2;

static_assert(!std::is_polymorphic_v<tMsgBuffer>);
static_assert(!std::is_polymorphic_v<tPtp4lTimeRef>);

/// A function that a derived class adds lands behind all slots of its base.
template <typename Base>
struct Derived : Base {
    virtual void added() = 0;
};

template <typename Class>
std::size_t slotsOf() {
    return slotOf(&Derived<Class>::added);
}

/// Names a test after its class.
struct ClassName {
    template <typename Class>
    static std::string GetName(int /*index*/) {
        int result = 0;
        const std::unique_ptr<char, decltype(&std::free)> text(
            abi::__cxa_demangle(typeid(Class).name(), nullptr, nullptr, &result), &std::free);
        const std::string name = text.get();
        return name.substr(name.rfind(':') + 1);
    }
};

template <typename Class>
class WireObjectSlotsTest : public testing::Test {};

using WireObjects =
    testing::Types<iMsgSerializable, tPtpClockIdentity, tPtpPortIdentity, tPtpClockQuality,
                   tPtpScaledNs96, tPtpText, tPtpTlv, tPtpMgmtTlv, tPtp4lTimeStatusMgmtTlv,
                   tPtp4lParentDataSetMgmtTlv, tPtp4lDefaultDataSetMgmtTlv,
                   tPtp4lPortDataSetMgmtTlv, tPtp4lPortDataSetNpMgmtTlv,
                   tPtp4lPortPropertiesMgmtTlv, tPtpMsgHeader, tPtpMgmtMsg>;
TYPED_TEST_SUITE(WireObjectSlotsTest, WireObjects, ClassName);

TYPED_TEST(WireObjectSlotsTest, ReadingStandsBeforeWriting) {
    EXPECT_EQ(slotOf(&TypeParam::deserialize), destructors);
    EXPECT_EQ(slotOf(&TypeParam::serialize), destructors + 1);
}

template <typename Class>
class SizedObjectSlotsTest : public testing::Test {};

using SizedObjects = testing::Types<tPtpTlv, tPtpMgmtTlv, tPtp4lTimeStatusMgmtTlv,
                                    tPtp4lParentDataSetMgmtTlv, tPtp4lDefaultDataSetMgmtTlv,
                                    tPtp4lPortDataSetMgmtTlv, tPtp4lPortDataSetNpMgmtTlv,
                                    tPtp4lPortPropertiesMgmtTlv, tPtpMsgHeader, tPtpMgmtMsg>;
TYPED_TEST_SUITE(SizedObjectSlotsTest, SizedObjects, ClassName);

TYPED_TEST(SizedObjectSlotsTest, SizeIsTheLast) {
    EXPECT_EQ(slotOf(&TypeParam::size), destructors + 2);
    EXPECT_EQ(slotsOf<TypeParam>(), destructors + 3);
}

TEST(SerializableSlotsTest, ThereIsNothingBehindWriting) {
    EXPECT_EQ(slotsOf<iMsgSerializable>(), destructors + 2);
}

template <typename Class>
class AddressSlotsTest : public testing::Test {};

using Addresses = testing::Types<iMsgAddress, tUdsMsgAddress>;
TYPED_TEST_SUITE(AddressSlotsTest, Addresses, ClassName);

TYPED_TEST(AddressSlotsTest, AddressesStandBeforeLengthAndPath) {
    EXPECT_EQ(slotOf(&TypeParam::receiveAddress), destructors);
    EXPECT_EQ(slotOf(&TypeParam::sendAddress), destructors + 1);
    EXPECT_EQ(slotOf(&TypeParam::length), destructors + 2);
    EXPECT_EQ(slotOf(&TypeParam::path), destructors + 3);
    EXPECT_EQ(slotsOf<TypeParam>(), destructors + 4);
}

template <typename Class>
class InterfaceSlotsTest : public testing::Test {
protected:
    using Receive = void (Class::*)(tMsgBuffer&, std::uint32_t, zeerr::Status&);
    using ReceiveFrom = void (Class::*)(tMsgBuffer&, iMsgAddress&, std::uint32_t, zeerr::Status&);
};

using Interfaces = testing::Types<iMsgInterface, tUdsMsgInterface>;
TYPED_TEST_SUITE(InterfaceSlotsTest, Interfaces, ClassName);

TYPED_TEST(InterfaceSlotsTest, ReceiveWithoutSenderStandsBeforeReceiveWithSender) {
    const typename TestFixture::Receive receive = &TypeParam::receive;
    const typename TestFixture::ReceiveFrom receiveFrom = &TypeParam::receive;
    EXPECT_EQ(slotOf(&TypeParam::open), destructors);
    EXPECT_EQ(slotOf(&TypeParam::close), destructors + 1);
    EXPECT_EQ(slotOf(&TypeParam::isOpen), destructors + 2);
    EXPECT_EQ(slotOf(&TypeParam::send), destructors + 3);
    EXPECT_EQ(slotOf(receive), destructors + 4);
    EXPECT_EQ(slotOf(receiveFrom), destructors + 5);
    EXPECT_EQ(slotsOf<TypeParam>(), destructors + 6);
}

TEST(NodeSlotsTest, DestructorIsAlone) {
    EXPECT_EQ(slotsOf<tPtpMgmtNode>(), destructors);
}

TEST(MetaDataSlotsTest, DestructorIsAlone) {
    EXPECT_EQ(slotsOf<tPtp4lMetaData>(), destructors);
}

TEST(FetcherSlotsTest, FetchIsTheOnlyOneBehindTheDestructor) {
    EXPECT_EQ(slotOf(&tGetDataFromPtp4l::fetch), destructors);
    EXPECT_EQ(slotsOf<tGetDataFromPtp4l>(), destructors + 1);
}

template <typename Class>
class ExceptionSlotsTest : public testing::Test {};

using Exceptions = testing::Types<zeerr::ExceptionBase, zeerr::Exception>;
TYPED_TEST_SUITE(ExceptionSlotsTest, Exceptions, ClassName);

TYPED_TEST(ExceptionSlotsTest, WhatIsTheOnlyOneBehindTheDestructor) {
    EXPECT_EQ(slotOf(&TypeParam::what), destructors);
    EXPECT_EQ(slotsOf<TypeParam>(), destructors + 1);
}

} // namespace
