#include "Requests.h"

#include "host/server/RawClient.h"
#include "host/server/RequestText.h"

namespace qelo::soak {
namespace {

using server::classNameParameter;
using server::Post;
using server::textParameter;

constexpr char kNameSpace[] = "root/cimv2";

std::string instanceName(const std::string& className, const std::string& name) {
    return "<INSTANCENAME CLASSNAME=\"" + className +
           "\"><KEYBINDING NAME=\"CreationClassName\"><KEYVALUE>" + className +
           "</KEYVALUE></KEYBINDING><KEYBINDING NAME=\"Name\"><KEYVALUE>" + name +
           "</KEYVALUE></KEYBINDING></INSTANCENAME>";
}

std::string parameter(const std::string& name, const std::string& content) {
    return "<IPARAMVALUE NAME=\"" + name + "\">" + content + "</IPARAMVALUE>";
}

Post intrinsic(const std::string& method, const std::string& parameters,
               const std::string& nameSpace = kNameSpace) {
    Post post;
    post.method = method;
    post.object = nameSpace;
    post.body = server::intrinsicRequest(method, parameters, nameSpace);
    return post;
}

Post extrinsic(const std::string& className, const std::string& method,
               const std::string& arguments) {
    Post post;
    post.method = method;
    post.object = std::string(kNameSpace) + ":" + className;
    post.body =
        server::messageElement("<METHODCALL NAME=\"" + method + "\"><LOCALCLASSPATH>" +
                               server::nameSpaceElement(kNameSpace) + "<CLASSNAME NAME=\"" +
                               className + "\"/></LOCALCLASSPATH>" + arguments + "</METHODCALL>");
    return post;
}

std::string argument(const std::string& name, const std::string& value) {
    return "<PARAMVALUE NAME=\"" + name + "\" PARAMTYPE=\"string\"><VALUE>" + value +
           "</VALUE></PARAMVALUE>";
}

const std::vector<std::string>& classes() {
    static const std::vector<std::string> names = {
        "ZANTH_Account",
        "ZANTH_Group",
        "ZANTH_SimIdentity",
        "ZANTH_AccountManagementService",
        "ZANTH_AccountManagementCapabilities",
        "ZANTH_AccountHostedService",
        "ZANTH_SimElementCapabilities",
        "ZANTH_ComputerSystem",
        "CIM_ManagedElement",
        "ZANTH_Nothing",
    };
    return names;
}

std::string newInstance(const std::string& name) {
    return "<INSTANCE CLASSNAME=\"ZANTH_Account\"><PROPERTY NAME=\"Name\" TYPE=\"string\"><VALUE>" +
           name + "</VALUE></PROPERTY></INSTANCE>";
}

} // namespace

Requests::Requests(std::uint32_t seed, std::string credentials, std::vector<std::string> accounts)
    : random_(seed), credentials_(std::move(credentials)), accounts_(std::move(accounts)) {}

std::size_t Requests::any(std::size_t count) {
    return std::uniform_int_distribution<std::size_t>(0, count - 1)(random_);
}

Request Requests::asked(std::pair<Post, Reply> choice) const {
    choice.first.credentials = credentials_;
    return {choice.first.text(), Ending::Answered, 200, choice.second};
}

std::string Requests::anyAccount() { return accounts_[any(accounts_.size())]; }

Request Requests::operation() { return any(2) == 0 ? onClass() : onInstance(); }

Request Requests::onClass() {
    const std::string& className = classes()[any(classes().size())];
    const Reply reply = className == "ZANTH_Nothing" ? Reply::Error : Reply::Result;
    const std::string deep = any(2) == 0 ? "true" : "false";
    const std::vector<std::pair<Post, Reply>> choice = {
        {intrinsic("EnumerateInstances", classNameParameter(className)), reply},
        {intrinsic("EnumerateInstanceNames", classNameParameter(className)), reply},
        {intrinsic("EnumerateInstances", classNameParameter(className), "root/nowhere"),
         Reply::Error},
        {intrinsic("GetClass", classNameParameter(className)), reply},
        {intrinsic("EnumerateClasses", textParameter("DeepInheritance", deep)), Reply::Result},
        {intrinsic("EnumerateClassNames", textParameter("DeepInheritance", deep)), Reply::Result},
        {intrinsic("GetQualifier", textParameter("QualifierName", "Key")), Reply::Result},
        {intrinsic("EnumerateQualifiers", ""), Reply::Result},
        {intrinsic("ExecQuery", textParameter("QueryLanguage", "WQL") +
                                    textParameter("Query", "select * from ZANTH_Account")),
         Reply::Error},
        {intrinsic("Nonsense", ""), Reply::Error},
    };
    return asked(choice[any(choice.size())]);
}

Request Requests::onInstance() {
    const bool unknown = any(4) == 0;
    const Reply reply = unknown ? Reply::Error : Reply::Result;
    const std::string account = unknown ? "nobody-here" : anyAccount();
    const std::string path = instanceName("ZANTH_Account", account);
    const std::string service = instanceName("ZANTH_AccountManagementService", account);
    const std::string list =
        parameter("PropertyList", "<VALUE.ARRAY><VALUE>UserID</VALUE></VALUE.ARRAY>");
    const std::string property = textParameter("PropertyName", "UserID");
    const std::vector<std::pair<Post, Reply>> choice = {
        {intrinsic("GetInstance", parameter("InstanceName", path)), reply},
        {intrinsic("GetInstance", parameter("InstanceName", path) + list), reply},
        {intrinsic("GetProperty", parameter("InstanceName", path) + property), reply},
        {intrinsic("SetProperty",
                   parameter("InstanceName", path) + property + textParameter("NewValue", "1")),
         Reply::Error},
        {intrinsic("Associators", parameter("ObjectName", service)), Reply::Result},
        {intrinsic("AssociatorNames", parameter("ObjectName", service)), Reply::Result},
        {intrinsic("References", parameter("ObjectName", service)), Reply::Result},
        {intrinsic("ReferenceNames", parameter("ObjectName", path)), Reply::Result},
        {intrinsic("CreateInstance", parameter("NewInstance", newInstance(account))), Reply::Error},
        {intrinsic("DeleteInstance", parameter("InstanceName", path)), Reply::Error},
        {intrinsic("ModifyInstance", parameter("ModifiedInstance", "<VALUE.NAMEDINSTANCE>" + path +
                                                                       newInstance(account) +
                                                                       "</VALUE.NAMEDINSTANCE>")),
         Reply::Error},
    };
    return asked(choice[any(choice.size())]);
}

// Changes are made by the tools of the system, which takes its time; most are refused before.
Request Requests::method() {
    if (any(20) == 0) {
        return change();
    }
    const std::vector<Post> posts = {
        extrinsic("ZANTH_Account", "DeleteUser", argument("Name", "root")),
        extrinsic("ZANTH_Account", "ModifyUser", argument("Name", "nobody-here")),
        extrinsic("ZANTH_Account", "SetPassword",
                  argument("Name", "nobody-here") + argument("UserPassword", "xyzzy plugh")),
        extrinsic("ZANTH_Account", "CreateUser", argument("Name", "Bad:Name")),
        extrinsic("ZANTH_Account", "Nonsense", argument("Name", anyAccount())),
        extrinsic("ZANTH_Group", "DeleteGroup", argument("Name", "none")),
        extrinsic("ZANTH_Nothing", "DeleteGroup", argument("Name", "none")),
    };
    return asked({posts[any(posts.size())], Reply::Error});
}

// Whether it is refused depends on what other clients did before.
Request Requests::change() {
    const std::string account = argument("Name", anyAccount());
    const std::string guest = argument("Name", "guest" + std::to_string(any(4)));
    const std::vector<Post> posts = {
        extrinsic("ZANTH_Account", "ModifyUser",
                  account + argument("FullName", "Number " + std::to_string(any(1000)))),
        extrinsic("ZANTH_Account", "SetPassword", account + argument("UserPassword", "xyzzy")),
        extrinsic("ZANTH_Account", "DisableUser", account),
        extrinsic("ZANTH_Account", "CreateUser", guest),
        extrinsic("ZANTH_Account", "DeleteUser", guest),
        extrinsic("ZANTH_Group", "CreateGroup", argument("Name", "guests")),
        extrinsic("ZANTH_Group", "AddMember",
                  argument("Name", "guests") + argument("Member", anyAccount())),
        extrinsic("ZANTH_Group", "DeleteGroup", argument("Name", "guests")),
    };
    Request request = asked({posts[any(posts.size())], Reply::Any});
    request.change = true;
    return request;
}

Request Requests::malformed() {
    Post post = intrinsic("EnumerateInstances", classNameParameter("ZANTH_Account"));
    post.credentials = credentials_;
    switch (any(6)) {
    case 0:
        post.body += "<";
        break;
    case 1:
        post.body.resize(any(post.body.size()));
        break;
    case 2:
        post.method = "GetInstance";
        break;
    case 3:
        post.body.insert(post.body.find("<CIM "), "<!DOCTYPE CIM [<!ENTITY a \"b\">]>");
        break;
    case 4:
        post.body = std::string(any(3000), '<');
        break;
    default:
        for (int i = 0; i < 100; ++i) {
            post.body += "<a>";
        }
    }
    return {post.text(), Ending::Answered, 400};
}

Request Requests::broken() {
    Request request = any(4) == 0 ? method() : operation();
    switch (any(3)) {
    case 0:
        request.ending = Ending::HalfSent;
        request.text.resize(1 + any(request.text.size() - 1));
        break;
    case 1:
        request.ending = Ending::Left;
        break;
    default:
        request.ending = Ending::Reset;
    }
    return request;
}

// Before anybody looks at the body.
Request Requests::refused() {
    Post post = intrinsic("EnumerateInstances", classNameParameter("ZANTH_Account"));
    post.credentials = credentials_;
    switch (any(8)) {
    case 0:
        return {"GET /cimom HTTP/1.1\r\nHost: localhost\r\nAuthorization: Basic " +
                    server::base64(credentials_) + "\r\n\r\n",
                Ending::Answered, 405};
    case 1:
        post.credentials.clear();
        return {post.text(), Ending::Answered, 401};
    case 2:
        post.furtherHeaders = "X-Large: " + std::string(20'000, 'x') + "\r\n";
        return {post.text(), Ending::Answered, 431};
    case 3:
        post.furtherHeaders = "CIMMethod: GetInstance\r\n";
        return {post.text(), Ending::Answered, 400};
    case 4:
        return {std::string(1 + any(300), static_cast<char>('a' + any(26))) + "\r\n\r\n",
                Ending::Answered, 0};
    case 5:
        return {"\x16\x03\x01\x02\r\n\r\n", Ending::Answered, 0};
    case 6:
        // Its answer is held back for a second.
        if (any(20) == 0) {
            post.credentials = "root:wrong";
            return {post.text(), Ending::Answered, 401};
        }
        return operation();
    default:
        if (any(20) == 0) {
            post.body += std::string(5'000'000, ' ');
            return {post.text(), Ending::Answered, 0};
        }
        return operation();
    }
}

Request Requests::next() {
    const std::size_t kind = any(100);
    if (kind < 70) {
        return operation();
    }
    if (kind < 80) {
        return method();
    }
    if (kind < 87) {
        return malformed();
    }
    return kind < 94 ? broken() : refused();
}

} // namespace qelo::soak
