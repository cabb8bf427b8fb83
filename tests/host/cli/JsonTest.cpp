#include <gmock/gmock.h>

#include <nlohmann/json.hpp>

#include "host/cli/Program.h"

namespace cimhost::test {
namespace {

using Json = nlohmann::ordered_json;

Json jsonOf(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), {"--format", "json"});
    const ProgramResult shown = run(arguments);
    EXPECT_EQ(shown.status, 0) << shown.error;
    return Json::parse(shown.output);
}

TEST(JsonOutput, AnInstanceHasItsPathAndItsPropertiesInOrderWithTypesAndValues) {
    const Json box = jsonOf({"gi", "Test_Box.Name=\"A\""});
    EXPECT_EQ(box["path"], Json::parse(R"({"uri": "root/cimv2:Test_Box.Name=\"A\"", "host": null,
        "namespace": "root/cimv2", "class": "Test_Box",
        "keys": {"Name": {"type": "string", "array": false, "value": "A"}}})"));
    const Json properties = Json::parse(R"({
        "Name": {"type": "string", "array": false, "value": "A"},
        "Size": {"type": "uint32", "array": false, "value": 4294967295},
        "Open": {"type": "boolean", "array": false, "value": true},
        "Packed": {"type": "datetime", "array": false, "value": "20260131120000.000000+060"},
        "Labels": {"type": "string", "array": true, "value": ["this side \"up\"", "two\nlines"]},
        "Shelf": {"type": "sint8", "array": false, "value": -3},
        "Mark": {"type": "char16", "array": false, "value": "\u20ac"},
        "Weight": {"type": "real64", "array": false, "value": 2.5},
        "Serial": {"type": "uint64", "array": false, "value": 18446744073709551615},
        "Inside": {"type": "reference", "array": false, "value": {"uri": "root/cimv2:Test_Box.Name=\"B\"",
            "host": null, "namespace": "root/cimv2", "class": "Test_Box",
            "keys": {"Name": {"type": "string", "array": false, "value": "B"}}}},
        "Note": {"type": "string", "array": false, "value": null}})");
    EXPECT_EQ(box["properties"].dump(), properties.dump()) << "the order counts too";
}

TEST(JsonOutput, ListsAreArrays) {
    const Json boxes = jsonOf({"ei", "Test_Box"});
    ASSERT_EQ(boxes.size(), 2U);
    EXPECT_EQ(boxes[1]["path"]["uri"], "root/cimv2:Test_Box.Name=\"B\"");
    const Json paths = jsonOf({"ein", "Test_Box"});
    ASSERT_EQ(paths.size(), 2U);
    EXPECT_EQ(paths[0]["keys"]["Name"]["value"], "A");
}

TEST(JsonOutput, AssociationsHavePathsAsValues) {
    const Json links = jsonOf({"ri", "Test_Box.Name=\"A\"", "--result-class", "Test_Contains"});
    ASSERT_EQ(links.size(), 1U);
    EXPECT_EQ(links[0]["properties"]["Inner"]["type"], "reference");
    EXPECT_EQ(links[0]["properties"]["Inner"]["value"]["keys"]["Name"]["value"], "B");
    EXPECT_EQ(links[0]["path"]["keys"]["Outer"]["value"]["class"], "Test_Box");
}

TEST(JsonOutput, CreationReturnsThePath) {
    EXPECT_EQ(jsonOf({"ci", "Test_Box.Name=\"new\""})["uri"], "root/cimv2:Test_Box.Name=\"new\"");
}

TEST(JsonOutput, ClassesHaveKeysAndProviders) {
    const Json classes = jsonOf({"classes"});
    ASSERT_EQ(classes.size(), 8U);
    EXPECT_EQ(classes[1], Json::parse(R"({"class": "Test_Contains", "inSchema": true, "superclass": null,
        "association": true, "description": null, "keys": ["Outer", "Inner"], "properties": [
            {"name": "Outer", "type": "reference", "array": false, "referenceClass": "Test_Box", "key": true,
             "writable": false, "description": null},
            {"name": "Inner", "type": "reference", "array": false, "referenceClass": "Test_Box", "key": true,
             "writable": false, "description": null}],
        "providers": [{"provider": "CliTest",
        "location": "cli_test_provider", "instance": true, "association": true, "namespaces": ["root/cimv2"],
        "group": "boxes", "unload": null, "source": ")" +
                                      dataFile("test.reg") + R"(:9"}]})"));
    EXPECT_EQ(classes[3]["superclass"], "Test_Answer");
    EXPECT_TRUE(classes[3]["providers"].empty());
    EXPECT_FALSE(classes[7]["inSchema"]);
    EXPECT_EQ(classes[7]["class"], "Test_OnlyRegistered");
}

TEST(JsonOutput, RawShowsStatusResultsAndReturnDone) {
    const Json raw = jsonOf({"--raw", "ein", "Test_Box"});
    ASSERT_EQ(raw["answers"].size(), 1U);
    const Json& answer = raw["answers"][0];
    EXPECT_EQ(answer["status"], Json::parse(R"({"code": 0, "name": "CMPI_RC_OK", "message": null})"));
    EXPECT_EQ(answer["exception"], false);
    EXPECT_EQ(answer["returnDoneCount"], 1);
    ASSERT_EQ(answer["returned"].size(), 3U);
    EXPECT_EQ(answer["returned"][0]["kind"], "objectPath");
    EXPECT_EQ(answer["returned"][0]["objectPath"]["keys"]["Name"]["value"], "A");
    EXPECT_EQ(answer["returned"][2], Json::parse(R"({"kind": "done"})"));
}

}  // namespace
}  // namespace cimhost::test
