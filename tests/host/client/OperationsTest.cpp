// What each operation sends, and what becomes of the answer.
#include "ConnectionFixture.h"

namespace qelo::client {
namespace {

using cim::Type;
using cim::Value;
using ::testing::HasSubstr;

cim::ObjectPath account(const std::string& nameSpace = "root/cimv2") {
    cim::ObjectPath path(nameSpace, "Account");
    path.setKey("Name", Value::string("a<b"));
    path.setKey("Number", Value::unsignedInteger(Type::UInt16, 5));
    return path;
}

cim::Instance accountInstance() {
    cim::Instance instance(account());
    instance.setProperty("Name", Value::string("a<b"));
    instance.setProperty("Number", Value::unsignedInteger(Type::UInt16, 5));
    return instance;
}

class Operations : public ConnectionFixture {
protected:
    // "Name=Account LocalOnly=FALSE ..." of the last request, in the order in which it stood.
    std::string sent() {
        std::string text = lastRequest().method;
        for (const auto& parameter : lastRequest().intrinsicParameters) {
            text += " " + parameter.name + "=" + std::visit(Describe{}, parameter.value);
        }
        return text;
    }

private:
    struct Describe {
        std::string operator()(const std::string& text) const { return text; }
        std::string operator()(const cimxml::ClassName& name) const { return name.name; }
        std::string operator()(const cim::ObjectPath& path) const { return path.toText(); }
        std::string operator()(const cimxml::TextList& list) const {
            std::string text = "[";
            for (const auto& item : list) {
                text += item.value_or("NULL") + ",";
            }
            return text + "]";
        }
        template <class Other> std::string operator()(const Other&) const { return "?"; }
    };
};

const cim::ObjectPath kClass("root/cimv2", "Account");
constexpr char kPathText[] = "Account.Name=\"a<b\",Number=5";

TEST_F(Operations, EnumerateInstanceNames_gives_paths_in_the_namespace_of_the_request) {
    answerWith([](const cimxml::ResponseWriter& writer, std::string& body) {
        writer.path(body, account(), cimxml::PathForm::InstanceName);
        writer.path(body, account(), cimxml::PathForm::InstanceName);
    });
    std::vector<cim::ObjectPath> found;
    connection().enumerateInstanceNames(
        kClass, [&](const cim::ObjectPath& path) { found.push_back(path); });
    ASSERT_EQ(found.size(), 2U);
    EXPECT_EQ(found[0], account()) << "with the types of its keys";
    EXPECT_EQ(found[0].toText(true), account().toText(true));
    EXPECT_EQ(sent(), "EnumerateInstanceNames ClassName=Account");
    EXPECT_EQ(lastRequest().target.nameSpace(), "root/cimv2");
}

TEST_F(Operations, EnumerateInstances_asks_for_everything_below_the_class) {
    answerWith([](const cimxml::ResponseWriter& writer, std::string& body) {
        writer.instance(body, accountInstance(), cimxml::InstanceForm::Named, {});
    });
    std::vector<cim::Instance> found;
    const auto keep = [&](const cim::Instance& instance) { found.push_back(instance); };
    connection().enumerateInstances(kClass, {}, keep);
    EXPECT_EQ(sent(), "EnumerateInstances ClassName=Account LocalOnly=FALSE DeepInheritance=TRUE "
                      "IncludeQualifiers=FALSE IncludeClassOrigin=FALSE");
    connection().enumerateInstances(kClass, std::vector<std::string>{"A", "B"}, keep);
    EXPECT_THAT(sent(), HasSubstr(" PropertyList=[A,B,]"));
    connection().enumerateInstances(kClass, std::vector<std::string>{}, keep);
    EXPECT_THAT(sent(), HasSubstr(" PropertyList=[]"));
    ASSERT_EQ(found.size(), 3U);
    EXPECT_EQ(found[0], accountInstance());
    EXPECT_EQ(found[0].path().toText(true), account().toText(true));
}

TEST_F(Operations, GetInstance_has_the_path_that_was_asked_for) {
    answerWith([](const cimxml::ResponseWriter& writer, std::string& body) {
        writer.instance(body, accountInstance(), cimxml::InstanceForm::Plain, {});
    });
    EXPECT_EQ(connection().getInstance(account(), {}), accountInstance());
    EXPECT_EQ(sent(), std::string("GetInstance InstanceName=") + kPathText +
                          " LocalOnly=FALSE IncludeQualifiers=FALSE IncludeClassOrigin=FALSE");
}

TEST_F(Operations, GetInstance_without_a_result_fails) {
    answerWith([](const cimxml::ResponseWriter&, std::string&) {});
    EXPECT_THROW(connection().getInstance(account(), {}), CimError);
    EXPECT_THROW(connection().getClass(kClass), CimError);
}

TEST_F(Operations, Associations_send_their_filters) {
    answerWith([](const cimxml::ResponseWriter& writer, std::string& body) {
        writer.instance(body, accountInstance(), cimxml::InstanceForm::WithObjectPath, {});
    });
    std::vector<cim::Instance> found;
    const auto keep = [&](const cim::Instance& instance) { found.push_back(instance); };
    const AssociationFilter filter = {"A", "R", "role", "resultRole"};
    connection().associators(account(), filter, {}, keep);
    EXPECT_EQ(sent(), std::string("Associators ObjectName=") + kPathText +
                          " AssocClass=A ResultClass=R Role=role ResultRole=resultRole "
                          "IncludeQualifiers=FALSE IncludeClassOrigin=FALSE");
    connection().references(account(), filter, std::vector<std::string>{"P"}, keep);
    EXPECT_EQ(sent(), std::string("References ObjectName=") + kPathText +
                          " ResultClass=R Role=role IncludeQualifiers=FALSE "
                          "IncludeClassOrigin=FALSE PropertyList=[P,]");
    connection().associators(account(), {}, {}, keep);
    EXPECT_EQ(sent(), std::string("Associators ObjectName=") + kPathText +
                          " IncludeQualifiers=FALSE IncludeClassOrigin=FALSE");
    ASSERT_EQ(found.size(), 3U);
    EXPECT_EQ(found[0], accountInstance());
    EXPECT_EQ(found[0].path().host(), "") << "as providers in this process give it";
}

TEST_F(Operations, Names_of_associated_objects_come_as_object_paths) {
    answerWith([](const cimxml::ResponseWriter& writer, std::string& body) {
        writer.path(body, account("root/other"), cimxml::PathForm::ObjectPath);
    });
    std::vector<std::string> found;
    const auto keep = [&](const cim::ObjectPath& path) { found.push_back(path.toText(true)); };
    connection().associatorNames(account(), {"A", "R", "r", "rr"}, keep);
    EXPECT_EQ(sent(), std::string("AssociatorNames ObjectName=") + kPathText +
                          " AssocClass=A ResultClass=R Role=r ResultRole=rr");
    connection().referenceNames(account(), {"", "R", "r", ""}, keep);
    EXPECT_EQ(sent(),
              std::string("ReferenceNames ObjectName=") + kPathText + " ResultClass=R Role=r");
    const std::string expected = std::string("root/other:") + kPathText;
    EXPECT_EQ(found, (std::vector<std::string>{expected, expected}));
}

TEST_F(Operations, Methods_take_and_return_typed_values) {
    answerWith([](const cimxml::ResponseWriter& writer, std::string& body) {
        MethodResult result;
        result.returnValue = Value::unsignedInteger(Type::UInt32, 4);
        result.out.emplace_back("Made", Value::reference(account()));
        writer.methodResult(body, result);
    });
    const MethodResult result = connection().invokeMethod(
        account(), "Make", {{"N", Value::unsignedInteger(Type::UInt8, 7)}});
    EXPECT_EQ(result.returnValue, Value::unsignedInteger(Type::UInt32, 4));
    ASSERT_EQ(result.out.size(), 1U);
    EXPECT_EQ(result.out[0].first, "Made");
    EXPECT_EQ(result.out[0].second, Value::reference(account()));
    EXPECT_EQ(lastRequest().target, account());
    EXPECT_EQ(lastRequest().extrinsicParameters.at(0).value,
              Value::unsignedInteger(Type::UInt8, 7));
    connection().invokeMethod(kClass, "Make", {});
    EXPECT_EQ(lastRequest().target.toText(), "root/cimv2:Account");
}

// A request that is sent again when a kept connection turns out to be dead could do twice what
// it does.
TEST_F(Operations, Methods_never_use_a_kept_connection) {
    answerWith([](const cimxml::ResponseWriter& writer, std::string& body) {
        writer.methodResult(body, {});
    });
    connection().invokeMethod(account(), "Make", {});
    connection().invokeMethod(account(), "Make", {});
    EXPECT_EQ(requests().back().connection, 2);
}

TEST_F(Operations, Classes_and_their_names_are_asked_for) {
    answerWith([](const cimxml::ResponseWriter& writer, std::string& body) {
        cim::Class declaration;
        declaration.name = "Account";
        writer.declaration(body, declaration, {});
    });
    EXPECT_EQ(connection().getClass(kClass).name, "Account");
    EXPECT_EQ(sent(), "GetClass ClassName=Account LocalOnly=FALSE IncludeQualifiers=TRUE "
                      "IncludeClassOrigin=TRUE");
    answerWith([](const cimxml::ResponseWriter& writer, std::string& body) {
        writer.className(body, "B");
        writer.className(body, "C");
    });
    std::vector<std::string> names;
    const auto keep = [&](const std::string& name) { names.push_back(name); };
    connection().enumerateClassNames(kClass, true, keep);
    EXPECT_EQ(sent(), "EnumerateClassNames ClassName=Account DeepInheritance=TRUE");
    connection().enumerateClassNames(cim::ObjectPath("root/cimv2", ""), false, keep);
    EXPECT_EQ(sent(), "EnumerateClassNames DeepInheritance=FALSE");
    EXPECT_EQ(names, (std::vector<std::string>{"B", "C", "B", "C"}));
}

TEST_F(Operations, Errors_of_the_operation_are_thrown_as_they_are) {
    serve([](const SeenRequest& seen) {
        std::string body;
        cimxml::ResponseWriter(cimxml::parseRequest(seen.body), "h", "n")
            .error(body, 6, "no such account");
        return xmlAnswer(body);
    });
    EXPECT_EQ(failure(), "6: no such account");
}

TEST_F(Operations, Without_a_namespace_nothing_is_sent) {
    answerWith([](const cimxml::ResponseWriter&, std::string&) {});
    EXPECT_THROW(connection().getClass(cim::ObjectPath("", "C")), CimError);
    EXPECT_TRUE(requests().empty());
}

TEST_F(Operations, What_a_sink_throws_passes_and_the_connection_survives) {
    answerWith([](const cimxml::ResponseWriter& writer, std::string& body) {
        writer.path(body, account(), cimxml::PathForm::InstanceName);
    });
    EXPECT_THROW(connection().enumerateInstanceNames(
                     kClass, [](const cim::ObjectPath&) { throw std::logic_error("full"); }),
                 std::logic_error);
    EXPECT_EQ(failure(), "none");
}

} // namespace
} // namespace qelo::client
