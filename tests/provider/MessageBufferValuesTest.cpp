// Values of the provider's parameter lists, inserted into a message buffer directly, not through its stream.

#include <cmpift.h>
#include <gtest/gtest.h>

#include <fstream>
#include <sstream>
#include <string>

#include "KO/Moniker.h"
#include "LeaseBase.h"
#include "RZLog/RZMessageBuffer.h"
#include "WarrantyBase.h"

namespace {

using RZLog::RZMessageBuffer;

using KO::LeaseWarrantyProvider::LeaseUnit;
using KO::LeaseWarrantyProvider::WarrantyUnit;
namespace Properties = KO::LeaseWarrantyProvider::Properties;

/** Formats a parameter list that contains a value twice. */
template <class Value>
std::string listed(const Value& value) {
    RZMessageBuffer buffer;
    buffer << " first=";
    buffer << value << " second=";
    buffer << value;
    return buffer.str(buffer);
}

std::string twice(const std::string& value) {
    return " first=" + value + " second=" + value;
}

template <class Pointee>
class MessageBufferPointer : public testing::Test {
protected:
    static std::string addressOf(const void* pointer) {
        std::ostringstream stream;
        stream << pointer;
        return stream.str();
    }
};

using Pointees = testing::Types<CMPIBroker, CMPIContext, CMPIInstance, CMPIObjectPath, KO::Moniker, LeaseUnit,
                                WarrantyUnit, Properties::Lease, Properties::Warranty, std::ifstream, const char*>;

struct PointeeNames {
    template <class Pointee>
    static std::string GetName(int number) {
        static constexpr const char* names[] = {"Broker",           "Context",   "Instance",     "ObjectPath",
                                                "Moniker",          "LeaseUnit", "WarrantyUnit", "LeaseProperty",
                                                "WarrantyProperty", "Stream",    "PropertyList"};
        return names[number];
    }
};

TYPED_TEST_SUITE(MessageBufferPointer, Pointees, PointeeNames);

TYPED_TEST(MessageBufferPointer, IsFormattedAsAnAddress) {
    TypeParam pointee{};
    TypeParam* pointer = &pointee;
    const TypeParam* pointerToConst = &pointee;
    EXPECT_EQ(listed(pointer), twice(this->addressOf(&pointee)));
    EXPECT_EQ(listed(pointerToConst), twice(this->addressOf(&pointee)));
}

TYPED_TEST(MessageBufferPointer, IsFormattedAsZeroIfNull) {
    TypeParam* pointer = nullptr;
    EXPECT_EQ(listed(pointer), twice("0"));
}

TEST(MessageBufferValue, FormatsAStringAsItsCharacters) {
    EXPECT_EQ(listed(std::string("ACME Co")), twice("ACME Co"));
    char characters[] = "in an array";
    EXPECT_EQ(listed(characters), twice("in an array"));
    EXPECT_EQ(listed<char*>(characters), twice("in an array"));
}

TEST(MessageBufferValue, FormatsAPropertyAsItsNumber) {
    EXPECT_EQ(listed(Properties::Lease::BargainRenewalOption), twice("12"));
    EXPECT_EQ(listed(Properties::Warranty::Duration), twice("3"));
}

TEST(MessageBufferValue, FormatsANumberOrAFlagAsDigits) {
    EXPECT_EQ(listed(4294967295U), twice("4294967295"));
    EXPECT_EQ(listed(true), twice("1"));
}

}  // namespace
