#include <gtest/gtest.h>

#include <memory>

#include "CimXmlFixture.h"
#include "cimxml/ObjectWriter.h"

// Writing instances and paths.

namespace cimhost::cimxml::test {
namespace {

TEST(ObjectWriterTest, AnObjectDoesNotDependOnThoseWrittenBefore) {
    const auto path = std::make_shared<const ObjectPath>(pathOf("Other", "a"));
    const auto embedded = std::make_shared<const Instance>(
        Instance{pathOf("Base", "x"), {{"Inner", Value::of("i")}, {"P", Value::of(false)}}});
    const Value values[] = {Value::of(1U),       Value::null(CMPI_uint32),         Value::of(true),
                            Value::of("string"), Value::array(CMPI_string, {"a"}), Value::null(CMPI_string, true),
                            Value::of(path),     Value::array(CMPI_ref, {path}),   Value::null(CMPI_ref),
                            Value::of(embedded), Value::null(CMPI_string),         Value::of("string")};
    const ObjectWriter writer("host", "root/test");
    for (const Value& value : values) {
        for (const char* name : {"P", "Q", "P"}) {
            Instance instance{pathOf("Base", "k"), {{"First", Value::of("f")}, {name, value}, {"Last", Value::of(2U)}}};
            instance.path.keys.push_back({name, value.isNull || value.isArray ? Value::of("k") : value});
            std::string xml;
            std::string alone;
            writer.append(xml, instance, ObjectForm::instanceWithPath);
            ObjectWriter("host", "root/test").append(alone, instance, ObjectForm::instanceWithPath);
            EXPECT_EQ(xml, alone);
        }
    }
}

}  // namespace
}  // namespace cimhost::cimxml::test
