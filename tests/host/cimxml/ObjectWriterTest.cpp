#include <gtest/gtest.h>

#include <future>
#include <memory>
#include <string>

#include "CimXmlFixture.h"
#include "cimxml/ObjectWriter.h"

// Writing instances and paths.

namespace cimhost::cimxml::test {
namespace {

std::string written(const Instance& instance) {
    std::string xml;
    ObjectWriter("host", "root/test").append(xml, instance, ObjectForm::instanceWithPath);
    return xml;
}

/** The XML of the first object that a thread writes. */
std::string writtenAlone(const Instance& instance) {
    return std::async(std::launch::async, written, instance).get();
}

TEST(ObjectWriterTest, AnObjectDoesNotDependOnThoseWrittenBefore) {
    const auto path = std::make_shared<const ObjectPath>(pathOf("Other", "a"));
    const auto embedded = std::make_shared<const Instance>(
        Instance{pathOf("Base", "x"), {{"Inner", Value::of("i")}, {"P", Value::of(false)}}});
    const Value values[] = {Value::of(1U),       Value::null(CMPI_uint32),         Value::of(true),
                            Value::of("string"), Value::array(CMPI_string, {"a"}), Value::null(CMPI_string, true),
                            Value::of(path),     Value::array(CMPI_ref, {path}),   Value::null(CMPI_ref),
                            Value::of(embedded), Value::null(CMPI_string),         Value::of("string")};
    for (const Value& value : values) {
        for (const char* name : {"P", "Q", "P"}) {
            Instance instance{pathOf(value.isNull ? "Base" : "Other", "k"),
                              {{"First", Value::of("f")}, {name, value}, {"Last", Value::of(2U)}}};
            instance.path.keys.push_back({name, value.isNull || value.isArray ? Value::of("k") : value});
            EXPECT_EQ(written(instance), writtenAlone(instance));
        }
    }
}

}  // namespace
}  // namespace cimhost::cimxml::test
