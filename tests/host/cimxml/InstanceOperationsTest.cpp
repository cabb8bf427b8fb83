#include "CimXmlFixture.h"

namespace cimhost::cimxml::test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

using InstanceOperationsTest = CimXmlTest;

TEST_F(InstanceOperationsTest, EnumerationCoversSubclassesWithProviders) {
    manager.answer = [](const Request& request) {
        return Response::ofInstances({instanceOf(request.path.className, request.path.className + "1")});
    };
    const XmlElement result = response("EnumerateInstances", className("ClassName", "base"));
    ASSERT_EQ(returned(result).size(), 2U);
    EXPECT_EQ(returned(result)[0].name, "VALUE.NAMEDINSTANCE");
    EXPECT_EQ(*returned(result)[1].child("INSTANCENAME")->attribute("CLASSNAME"), "Derived");
    ASSERT_EQ(manager.requests.size(), 2U);
    EXPECT_EQ(manager.requests[0].path.className, "Base");  // the letter case of the schema
}

TEST_F(InstanceOperationsTest, PropertyListsAreAppliedWhateverTheProviderReturns) {
    manager.answer = [](const Request& request) {
        return Response::ofInstances(
            {instanceOf(request.path.className, "a", {{"Size", Value::of(std::uint32_t{1})}})});
    };
    const XmlElement listed = response("EnumerateInstances", className("ClassName", "Derived") + properties({"size"}));
    EXPECT_THAT(namesIn(*returned(listed)[0].child("INSTANCE"), "PROPERTY"), ElementsAre("Size"));
    const XmlElement got =
        response("GetInstance", parameter("InstanceName", instanceName("Derived", "a")) + properties({}));
    EXPECT_THAT(namesIn(returned(got)[0], "PROPERTY"), IsEmpty());
    ASSERT_TRUE(manager.requests[0].properties);
    EXPECT_THAT(*manager.requests[0].properties, ElementsAre("size"));
}

TEST_F(InstanceOperationsTest, EnumerationThatIsNotDeepHasPropertiesOfTheClassOnly) {
    manager.answer = [](const Request& request) {
        return Response::ofInstances({instanceOf(request.path.className, "a", {{"Flag", Value::of(true)}})});
    };
    const XmlElement shallow =
        response("EnumerateInstances", className("ClassName", "Base") + value("DeepInheritance", "FALSE"));
    EXPECT_THAT(namesIn(*returned(shallow)[1].child("INSTANCE"), "PROPERTY"), ElementsAre("Name"));
    const XmlElement deep = response("EnumerateInstances", className("ClassName", "Base"));
    EXPECT_THAT(namesIn(*returned(deep)[1].child("INSTANCE"), "PROPERTY"), ElementsAre("Name", "Flag"));
}

TEST_F(InstanceOperationsTest, ClassOriginIsWrittenOnRequest) {
    manager.answer = [](const Request&) {
        return Response::ofInstances({instanceOf("Derived", "a", {{"Flag", Value::of(true)}})});
    };
    const XmlElement got = response(
        "GetInstance", parameter("InstanceName", instanceName("Derived", "a")) + value("IncludeClassOrigin", "true"));
    EXPECT_EQ(*returned(got)[0].children[0].attribute("CLASSORIGIN"), "Base");
    EXPECT_EQ(*returned(got)[0].children[1].attribute("CLASSORIGIN"), "Derived");
}

TEST_F(InstanceOperationsTest, ClassesWithoutProvidersHaveNoInstances) {
    EXPECT_THAT(returned(response("EnumerateInstances", className("ClassName", "Unserved"))), IsEmpty());
    EXPECT_EQ(statusOf(response("EnumerateInstances", className("ClassName", "Nothing"))), CMPI_RC_ERR_INVALID_CLASS);
    const std::string path = instanceName("Unserved", "a");
    const std::string instance = "<INSTANCE CLASSNAME=\"Unserved\"></INSTANCE>";
    EXPECT_EQ(statusOf(response("GetInstance", parameter("InstanceName", path))), CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(statusOf(response("DeleteInstance", parameter("InstanceName", path))), CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(statusOf(response("CreateInstance", parameter("NewInstance", instance))), CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(
        statusOf(response("ModifyInstance", parameter("ModifiedInstance", "<VALUE.NAMEDINSTANCE>" + path + instance +
                                                                              "</VALUE.NAMEDINSTANCE>"))),
        CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_THAT(manager.requests, IsEmpty());
}

TEST_F(InstanceOperationsTest, ParametersPropertiesAndKeysAreLimitedInNumber) {
    const std::string twice = className("ClassName", "Base") + className("classname", "Base");
    EXPECT_EQ(statusOf(response("EnumerateInstances", twice)), CMPI_RC_ERR_INVALID_PARAMETER);
    std::string keys;
    std::string sent;
    std::vector<std::string> names;
    for (int i = 0; i <= 1000; ++i) {
        const std::string name = "P" + std::to_string(i);
        keys += "<KEYBINDING NAME=\"" + name + "\"><KEYVALUE>a</KEYVALUE></KEYBINDING>";
        sent += "<PROPERTY NAME=\"" + name + "\" TYPE=\"string\"></PROPERTY>";
        names.push_back(name);
    }
    const auto error = [&](const std::string& operation, const std::string& parameters) {
        return *response(operation, parameters).child("ERROR")->attribute("DESCRIPTION");
    };
    EXPECT_THAT(error("EnumerateInstances", className("ClassName", "Base") + properties(names)),
                HasSubstr("VALUE.ARRAY has more than 1000 elements"));
    EXPECT_THAT(
        error("GetInstance", parameter("InstanceName", "<INSTANCENAME CLASSNAME=\"Base\">" + keys + "</INSTANCENAME>")),
        HasSubstr("INSTANCENAME has more than 1000 elements"));
    EXPECT_THAT(
        error("CreateInstance", parameter("NewInstance", "<INSTANCE CLASSNAME=\"Base\">" + sent + "</INSTANCE>")),
        HasSubstr("INSTANCE has more than 1000 elements"));
    EXPECT_THAT(manager.requests, IsEmpty());
}

TEST_F(InstanceOperationsTest, CharactersThatXmlCannotRepresentFailTheResponse) {
    manager.answer = [](const Request&) {
        return Response::ofInstances({instanceOf("Other", "a", {{"Letter", Value::of(CMPI_char16, Char16{1})}})});
    };
    const XmlElement failed = response("EnumerateInstances", className("ClassName", "Other"));
    ASSERT_EQ(statusOf(failed), CMPI_RC_ERR_FAILED);
    EXPECT_THAT(*failed.child("ERROR")->attribute("DESCRIPTION"), HasSubstr("Other.Letter"));
}

TEST_F(InstanceOperationsTest, AllTypesOfValuesAreWritten) {
    const Instance embedded = instanceOf("Base", "x<y");
    manager.answer = [&](const Request&) {
        return Response::ofInstances(
            {instanceOf("Derived", "a",
                        {{"B", Value::of(true)},
                         {"U", Value::of(std::uint64_t{18446744073709551615U})},
                         {"S", Value::of(std::int8_t{-5})},
                         {"R", Value::of(0.1)},
                         {"C", Value::of(Char16{0xE4})},
                         {"D", Value::of(DateTime{"20260131120000.000000+060"})},
                         {"N", Value::null(CMPI_uint16)},
                         {"A", Value::array(CMPI_string, {std::string("a&b"), std::monostate{}})},
                         {"P", Value::of(std::make_shared<const ObjectPath>(pathOf("Base", "q")))},
                         {"I", Value::of(std::make_shared<const Instance>(embedded))}})});
    };
    const std::string text = respond(request("GetInstance", parameter("InstanceName", instanceName("Derived", "a"))));
    for (const char* expected :
         {"<PROPERTY NAME=\"B\" TYPE=\"boolean\"><VALUE>TRUE</VALUE></PROPERTY>",
          "<PROPERTY NAME=\"U\" TYPE=\"uint64\"><VALUE>18446744073709551615</VALUE></PROPERTY>",
          "<PROPERTY NAME=\"S\" TYPE=\"sint8\"><VALUE>-5</VALUE></PROPERTY>",
          "<PROPERTY NAME=\"R\" TYPE=\"real64\"><VALUE>0.1</VALUE></PROPERTY>",
          "<PROPERTY NAME=\"C\" TYPE=\"char16\"><VALUE>\xC3\xA4</VALUE></PROPERTY>",
          "<PROPERTY NAME=\"D\" TYPE=\"datetime\"><VALUE>20260131120000.000000+060</VALUE></PROPERTY>",
          "<PROPERTY NAME=\"N\" TYPE=\"uint16\"></PROPERTY>",
          "<PROPERTY.ARRAY NAME=\"A\" TYPE=\"string\"><VALUE.ARRAY><VALUE>a&amp;b</VALUE><VALUE.NULL></VALUE.NULL>"
          "</VALUE.ARRAY></PROPERTY.ARRAY>",
          "<PROPERTY.REFERENCE NAME=\"P\"><VALUE.REFERENCE><LOCALINSTANCEPATH><LOCALNAMESPACEPATH>"
          "<NAMESPACE NAME=\"root\"></NAMESPACE><NAMESPACE NAME=\"test\"></NAMESPACE></LOCALNAMESPACEPATH>"
          "<INSTANCENAME CLASSNAME=\"Base\"><KEYBINDING NAME=\"Name\"><KEYVALUE VALUETYPE=\"string\" TYPE=\"string\">q"
          "</KEYVALUE></KEYBINDING></INSTANCENAME></LOCALINSTANCEPATH></VALUE.REFERENCE></PROPERTY.REFERENCE>",
          "EmbeddedObject=\"instance\"><VALUE>&lt;INSTANCE CLASSNAME=&quot;Base&quot;&gt;"}) {
        EXPECT_THAT(text, HasSubstr(expected));
    }
    EXPECT_THAT(text, testing::Not(HasSubstr("/>")));
    EXPECT_EQ(text.rfind("<?xml version=\"1.0\" encoding=\"utf-8\"?>\n<CIM ", 0), 0U);
}

TEST_F(InstanceOperationsTest, StringsThatXmlCannotRepresentFailTheResponse) {
    manager.answer = [](const Request&) {
        return Response::ofInstances({instanceOf("Base", "a", {{"Text", Value::of("b\x01")}})});
    };
    const XmlElement result = response("GetInstance", parameter("InstanceName", instanceName("Base", "a")));
    EXPECT_EQ(statusOf(result), CMPI_RC_ERR_FAILED);
    EXPECT_THAT(*result.child("ERROR")->attribute("DESCRIPTION"), HasSubstr("Base.Text"));
}

TEST_F(InstanceOperationsTest, RealNumbersHaveADecimalPoint) {
    constexpr std::pair<double, const char*> reals[] = {{36, "36.0"},      {-2, "-2.0"},         {0, "0.0"},
                                                        {1e30, "1.0e+30"}, {1.5e-20, "1.5e-20"}, {0.25, "0.25"}};
    for (const auto& [number, expected] : reals) {
        manager.answer = [value = number](const Request&) {
            return Response::ofInstances({instanceOf("Other", "a", {{"Ratio", Value::of(value)}})});
        };
        EXPECT_THAT(respond(request("EnumerateInstances", className("ClassName", "Other"))),
                    HasSubstr(std::string("TYPE=\"real64\"><VALUE>") + expected + "</VALUE>"));
    }
}

TEST_F(InstanceOperationsTest, CharactersOfPropertiesOutsideOfTheListAreNoError) {
    manager.answer = [](const Request& request) {
        return Response::ofInstances({instanceOf(request.path.className, "a", {{"Text", Value::of("b\x01")}})});
    };
    const std::string path = parameter("InstanceName", instanceName("Base", "a"));
    EXPECT_EQ(statusOf(response("GetInstance", path + properties({"Name"}))), 0);
    EXPECT_EQ(statusOf(response("GetInstance", path + properties({"name", "text"}))), CMPI_RC_ERR_FAILED);
    const std::string base = className("ClassName", "Base");
    EXPECT_EQ(statusOf(response("EnumerateInstances", base + value("DeepInheritance", "FALSE"))), 0);
    EXPECT_EQ(statusOf(response("EnumerateInstances", base)), CMPI_RC_ERR_FAILED);
    EXPECT_EQ(statusOf(response("OpenEnumerateInstances", base)), CMPI_RC_ERR_FAILED);
}

TEST_F(InstanceOperationsTest, ErrorsHaveTheCodeAndMessageOfTheProvider) {
    manager.answer = [](const Request&) { return Response::failed({CMPI_RC_ERR_NOT_FOUND, "no <a> \x02"}); };
    const XmlElement result = response("GetInstance", parameter("InstanceName", instanceName("Base", "a")));
    EXPECT_EQ(statusOf(result), CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(*result.child("ERROR")->attribute("DESCRIPTION"), "no <a> \xEF\xBF\xBD");
}

TEST_F(InstanceOperationsTest, CreationReadsValuesWithTheTypesOfTheClass) {
    manager.answer = [](const Request& request) { return Response::ofPaths({request.path}); };
    const XmlElement result = response(
        "CreateInstance",
        parameter(
            "NewInstance",
            "<INSTANCE CLASSNAME=\"derived\"><PROPERTY NAME=\"name\" TYPE=\"string\"><VALUE>&#228;</VALUE></PROPERTY>"
            "<PROPERTY NAME=\"Size\" TYPE=\"uint32\"><VALUE> 0x1F </VALUE></PROPERTY>"
            "<PROPERTY NAME=\"Flag\" TYPE=\"boolean\"><VALUE>True</VALUE></PROPERTY>"
            "<PROPERTY NAME=\"When\" TYPE=\"datetime\"></PROPERTY>"
            "<PROPERTY.ARRAY NAME=\"Tags\" TYPE=\"string\"><VALUE.ARRAY><VALUE>a</VALUE><VALUE.NULL/>"
            "</VALUE.ARRAY></PROPERTY.ARRAY></INSTANCE>"));
    EXPECT_EQ(returned(result)[0].name, "INSTANCENAME");
    const Request& sent = manager.requests.at(0);
    EXPECT_EQ(sent.operation, Operation::createInstance);
    EXPECT_EQ(sent.path.className, "Derived");
    ASSERT_EQ(sent.path.keys.size(), 1U);
    EXPECT_EQ(sent.path.keys[0].name, "Name");
    ASSERT_EQ(sent.instance.properties.size(), 5U);
    EXPECT_EQ(std::get<std::string>(sent.instance.properties[0].value.single), "\xC3\xA4");
    EXPECT_EQ(std::get<std::uint32_t>(sent.instance.properties[1].value.single), 31U);
    EXPECT_TRUE(std::get<bool>(sent.instance.properties[2].value.single));
    EXPECT_TRUE(sent.instance.properties[3].value.isNull);
    EXPECT_EQ(sent.instance.properties[3].value.type, CMPI_dateTime);
    EXPECT_EQ(sent.instance.properties[4].value.elements().size(), 2U);
}

TEST_F(InstanceOperationsTest, WrongValuesAreRefusedBeforeTheProvider) {
    const auto create = [&](const std::string& property) {
        return statusOf(response(
            "CreateInstance", parameter("NewInstance", "<INSTANCE CLASSNAME=\"Derived\">" + property + "</INSTANCE>")));
    };
    EXPECT_EQ(create("<PROPERTY NAME=\"Size\" TYPE=\"uint32\"><VALUE>1</VALUE><VALUE>2</VALUE></PROPERTY>"),
              CMPI_RC_ERR_INVALID_PARAMETER);
    for (const char* wrong : {"-1", "4294967296", "many", "", "1.5", "0x"}) {
        EXPECT_EQ(
            create(std::string("<PROPERTY NAME=\"Size\" TYPE=\"uint32\"><VALUE>") + wrong + "</VALUE></PROPERTY>"),
            CMPI_RC_ERR_INVALID_PARAMETER)
            << wrong;
    }
    EXPECT_EQ(create("<PROPERTY NAME=\"Flag\" TYPE=\"boolean\"><VALUE>perhaps</VALUE></PROPERTY>"),
              CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(create("<PROPERTY NAME=\"When\" TYPE=\"datetime\"><VALUE>20261301000000.000000+000</VALUE></PROPERTY>"),
              CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(create("<PROPERTY.ARRAY NAME=\"Size\" TYPE=\"uint32\"></PROPERTY.ARRAY>"), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(create("<PROPERTY NAME=\"Name\" TYPE=\"string\"/><PROPERTY NAME=\"NAME\" TYPE=\"string\"/>"),
              CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_THAT(manager.requests, IsEmpty());
}

TEST_F(InstanceOperationsTest, ModificationPassesPropertiesAndList) {
    const XmlElement result = response(
        "ModifyInstance", parameter("ModifiedInstance", "<VALUE.NAMEDINSTANCE>" + instanceName("Derived", "a") +
                                                            "<INSTANCE CLASSNAME=\"Derived\"><PROPERTY NAME=\"Size\" "
                                                            "TYPE=\"uint32\"><VALUE>5</VALUE></PROPERTY></INSTANCE>"
                                                            "</VALUE.NAMEDINSTANCE>") +
                              properties({"Size"}));
    EXPECT_EQ(statusOf(result), 0);
    EXPECT_EQ(result.child("IRETURNVALUE"), nullptr);
    const Request& sent = manager.requests.at(0);
    EXPECT_EQ(std::get<std::string>(sent.path.keys.at(0).value.single), "a");
    EXPECT_EQ(sent.instance.properties.size(), 1U);
    EXPECT_THAT(*sent.properties, ElementsAre("Size"));
}

TEST_F(InstanceOperationsTest, ModificationIgnoresPropertiesThatItsListDoesNotName) {
    const std::string instance =
        "<INSTANCE CLASSNAME=\"Derived\">"
        "<PROPERTY NAME=\"name\" TYPE=\"string\"><VALUE>a</VALUE></PROPERTY>"
        "<PROPERTY NAME=\"size\" TYPE=\"uint32\"><VALUE>5</VALUE></PROPERTY>"
        "<PROPERTY NAME=\"Unknown\" TYPE=\"string\"><VALUE>x</VALUE></PROPERTY></INSTANCE>";
    const auto namesSent = [&](const std::string& list) {
        manager.requests.clear();
        response("ModifyInstance",
                 parameter("ModifiedInstance", "<VALUE.NAMEDINSTANCE>" + instanceName("Derived", "a") + instance +
                                                   "</VALUE.NAMEDINSTANCE>") +
                     list);
        std::vector<std::string> names;
        for (const NamedValue& each : manager.requests.at(0).instance.properties) {
            names.push_back(each.name.string());
        }
        return names;
    };
    EXPECT_THAT(namesSent(properties({"Size"})), ElementsAre("Name", "Size"));
    EXPECT_THAT(namesSent(properties({"Unknown"})), ElementsAre("Name", "Unknown"));
    EXPECT_THAT(namesSent(""), ElementsAre("Name", "Size", "Unknown"));
}

TEST_F(InstanceOperationsTest, AModifiedInstanceIsOfTheClassOfItsName) {
    const auto modify = [&](const std::string& className) {
        return statusOf(response("ModifyInstance",
                                 parameter("ModifiedInstance", "<VALUE.NAMEDINSTANCE>" + instanceName("Derived", "a") +
                                                                   "<INSTANCE CLASSNAME=\"" + className +
                                                                   "\"></INSTANCE></VALUE.NAMEDINSTANCE>")));
    };
    for (const char* other : {"Base", "Other", "Nothing"}) {
        EXPECT_EQ(modify(other), CMPI_RC_ERR_INVALID_PARAMETER) << other;
    }
    EXPECT_THAT(manager.requests, IsEmpty());
    EXPECT_EQ(modify("DERIVED"), 0);
}

TEST_F(InstanceOperationsTest, PathsMustNameTheKeysOfTheClass) {
    const auto get = [&](const std::string& name) {
        return statusOf(response("GetInstance", parameter("InstanceName", name)));
    };
    EXPECT_EQ(get("<INSTANCENAME CLASSNAME=\"Base\"/>"), CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(get("<INSTANCENAME CLASSNAME=\"Base\"><KEYBINDING NAME=\"Size\"><KEYVALUE>1</KEYVALUE></KEYBINDING>"
                  "</INSTANCENAME>"),
              CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(get("<VALUE>x</VALUE>"), CMPI_RC_ERR_INVALID_PARAMETER);
    manager.answer = [](const Request&) { return Response::ofInstances({instanceOf("Base", "a")}); };
    EXPECT_EQ(get("<INSTANCENAME CLASSNAME=\"Base\"><KEYVALUE>a</KEYVALUE></INSTANCENAME>"), 0);
}

TEST_F(InstanceOperationsTest, APathInAParameterNamesNoNamespace) {
    const std::string other =
        "<LOCALINSTANCEPATH><LOCALNAMESPACEPATH><NAMESPACE NAME=\"other\"/></LOCALNAMESPACEPATH>" +
        instanceName("Base", "a") + "</LOCALINSTANCEPATH>";
    for (const std::string& path : {other, "<VALUE.REFERENCE>" + other + "</VALUE.REFERENCE>"}) {
        EXPECT_EQ(statusOf(response("GetInstance", parameter("InstanceName", path))), CMPI_RC_ERR_INVALID_PARAMETER);
        EXPECT_EQ(statusOf(response("Associators", parameter("ObjectName", path))), CMPI_RC_ERR_INVALID_PARAMETER);
    }
    EXPECT_THAT(manager.requests, IsEmpty());
}

TEST_F(InstanceOperationsTest, BooleansMustBeBooleansAlsoIfTheyAreIgnored) {
    for (const char* name : {"LocalOnly", "IncludeQualifiers"}) {
        const auto statusWith = [&](const char* characters) {
            return statusOf(response("EnumerateInstances", className("ClassName", "Base") + value(name, characters)));
        };
        EXPECT_EQ(statusWith("TRUE"), 0);
        EXPECT_EQ(statusWith("perhaps"), CMPI_RC_ERR_INVALID_PARAMETER);
    }
}

TEST_F(InstanceOperationsTest, AssociatorsHavePathsWithHostAndNamespace) {
    manager.answer = [](const Request& request) {
        return returnsPaths(request.operation) ? Response::ofPaths({pathOf("Base", "b")})
                                               : Response::ofInstances({instanceOf("Base", "b")});
    };
    const std::string object = parameter("ObjectName", instanceName("Base", "a"));
    const XmlElement instances = response("Associators", object + className("AssocClass", "link"));
    ASSERT_EQ(returned(instances).size(), 1U);
    const XmlElement first = returned(instances)[0];
    EXPECT_EQ(first.name, "VALUE.OBJECTWITHPATH");
    const XmlElement* place = first.child("INSTANCEPATH")->child("NAMESPACEPATH");
    EXPECT_EQ(place->child("HOST")->characters, "testhost");
    EXPECT_EQ(place->child("LOCALNAMESPACEPATH")->children.size(), 2U);
    EXPECT_EQ(*manager.requests[0].filter.associationClass, "Link");
    const XmlElement paths = response("ReferenceNames", object);
    EXPECT_EQ(returned(paths)[0].name, "OBJECTPATH");
}

TEST_F(InstanceOperationsTest, AssociationsOfClassesWithoutProvidersAreEmpty) {
    const std::string object = parameter("ObjectName", instanceName("Base", "a"));
    EXPECT_EQ(statusOf(response("References", object + className("ResultClass", "Nothing"))),
              CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_THAT(returned(response("References", object + className("ResultClass", "Other"))), IsEmpty());
    EXPECT_THAT(manager.requests, IsEmpty());
}

TEST_F(InstanceOperationsTest, TheInteropNamespaceDescribesTheServer) {
    for (const char* nameSpace : {"root/interop", "interop", "ROOT/Interop"}) {
        const XmlElement spaces = response("EnumerateInstances", className("ClassName", "CIM_Namespace"), nameSpace);
        EXPECT_EQ(returned(spaces).size(), 3U) << nameSpace;
    }
    const XmlElement names = response("EnumerateInstanceNames", className("ClassName", "__Namespace"), "root/interop");
    EXPECT_EQ(returned(names).size(), 3U);
    const std::string manager1 =
        respond(request("EnumerateInstances", className("ClassName", "CIM_ObjectManager"), "interop"));
    EXPECT_THAT(manager1, HasSubstr("1.2.3"));
    EXPECT_EQ(statusOf(response("GetInstance", parameter("InstanceName", instanceName("__Namespace", "root/test")),
                                "interop")),
              0);
    EXPECT_EQ(statusOf(response("GetInstance", parameter("InstanceName", instanceName("__Namespace", "x")), "interop")),
              CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(statusOf(response("DeleteInstance", parameter("InstanceName", instanceName("__Namespace", "root/test")),
                                "interop")),
              CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(statusOf(response("EnumerateInstances", className("ClassName", "Base"), "interop")),
              CMPI_RC_ERR_INVALID_CLASS);
}

}  // namespace
}  // namespace cimhost::cimxml::test
