#include <gmock/gmock.h>

#include "host/schema/Schemas.h"
#include "schema/ObjectPathText.h"

namespace cimhost::test {
namespace {

constexpr auto classes = R"(
    class Shelf { [Key] string Name; [Key] uint8 Floor; string Colour = "grey"; };
    [Association] class Beside { [Key] Shelf REF Left; [Key] Shelf REF Right; };)";

std::string listOf(const Instance& instance) {
    std::string text;
    for (const NamedValue& property : instance.properties) {
        text += property.name.string() + "=" + formatMof(property.value) + ";";
    }
    return text;
}

TEST(MofInstance, HasItsPropertiesAsWrittenThenTheDefaults) {
    const Schema schema = schemaOf(classes + std::string("instance of SHELF { floor = 0x2; NAME = \"A\"; };"));
    ASSERT_EQ(schema.instances().size(), 1U);
    const Instance& shelf = schema.instances()[0];
    EXPECT_EQ(listOf(shelf), "Floor=2;Name=\"A\";Colour=\"grey\";");
    EXPECT_EQ(shelf.properties[0].value.type, CMPI_uint8);
    EXPECT_EQ(formatObjectPath(shelf.path), "Shelf.Name=\"A\",Floor=2");
}

TEST(MofInstance, RefersToOtherInstancesByPathAndByAlias) {
    const Schema schema = schemaOf(classes + std::string(R"(
        instance of Shelf as $One { Name = "A"; Floor = 1; };
        instance of Beside { Left = $One; Right = "root/cimv2:Shelf.Name=\"B\",Floor=2"; };)"));
    ASSERT_EQ(schema.instances().size(), 2U);
    EXPECT_EQ(listOf(schema.instances()[1]),
              R"(Left="Shelf.Name=\"A\",Floor=1";Right="root/cimv2:Shelf.Name=\"B\",Floor=2";)");
    const auto right = element<std::shared_ptr<const ObjectPath>>(schema.instances()[1].properties[1].value);
    EXPECT_EQ(right->keys[1].value.type, CMPI_uint8) << "typed as the class says";
}

TEST(MofInstance, AReferenceMustBeAPathToTheRightClass) {
    EXPECT_THAT(refusalOf(classes + std::string("instance of Beside { Left = \"Shelf.Floor=300\"; };")),
                testing::HasSubstr("0 to 255"));
    EXPECT_THAT(refusalOf(classes + std::string("instance of Beside { Left = \"Beside\"; };")),
                testing::HasSubstr("must refer to a Shelf"));
    EXPECT_THAT(refusalOf(classes + std::string("instance of Beside { Left = 5; };")),
                testing::HasSubstr("is not a reference"));
}

}  // namespace
}  // namespace cimhost::test
