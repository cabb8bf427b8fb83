#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "broker/Broker.h"
#include "broker/RequestScope.h"
#include "support/Values.h"

/** A broker with one request on the test's thread. */
class BrokerTest : public testing::Test {
protected:
    explicit BrokerTest(cimhost::BrokerOptions options = {}) : broker(std::move(options)) {
        scope = std::make_unique<cimhost::RequestScope>(broker);
    }

    const CMPIBroker* handle() const { return broker.handle(); }
    const CMPIBrokerEncFT& make() const { return *handle()->eft; }

    CMPIString* newString(const char* text) { return make().newString(handle(), text, &status); }
    CMPIObjectPath* newPath(const char* className = "X") {
        return make().newObjectPath(handle(), "root/cimv2", className, &status);
    }
    CMPIInstance* newInstance(const char* className = "X") {
        return make().newInstance(handle(), newPath(className), &status);
    }

    /** The characters of a string object; "(null)" if there are none. */
    static std::string characters(const CMPIString* string) {
        return string == nullptr ? "(null)" : string->ft->getCharPtr(string, nullptr);
    }

    cimhost::Broker broker;
    std::unique_ptr<cimhost::RequestScope> scope;
    CMPIStatus status{CMPI_RC_ERROR, nullptr};  ///< of the last call that received it
};

/** A value as a parameter of table functions. */
inline CMPIValue uint32Value(CMPIUint32 number) {
    CMPIValue value{};
    value.uint32 = number;
    return value;
}

/** Characters as a value of type CMPI_chars. */
inline const CMPIValue* charsValue(const char* text) {
    return reinterpret_cast<const CMPIValue*>(text);
}
