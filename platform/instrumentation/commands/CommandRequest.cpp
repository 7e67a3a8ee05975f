#include "CommandRequest.h"

#include "CimDay.h"
#include "FieldRules.h"

#include <algorithm>
#include <array>

namespace qelo::store {

namespace {

enum Field : unsigned {
    kName,
    kFullName,
    kUserId,
    kGroupId,
    kHomeDirectory,
    kScriptPath,
    kUserPassword,
    kCreateHome,
    kRemoveHome,
    kMember,
    kMinimumDays,
    kMaximumDays,
    kWarningDays,
    kInactiveDays,
    kExpiration
};

struct FieldRow {
    std::string_view name;
    ArgumentType type;
};

// In the order of Field.
constexpr std::array<FieldRow, 15> kFields{{{"Name", ArgumentType::Text},
                                            {"FullName", ArgumentType::Text},
                                            {"UserID", ArgumentType::Number},
                                            {"GroupId", ArgumentType::Number},
                                            {"HomeDirectory", ArgumentType::Text},
                                            {"ScriptPath", ArgumentType::Text},
                                            {"UserPassword", ArgumentType::Text},
                                            {"CreateHome", ArgumentType::Number},
                                            {"RemoveHome", ArgumentType::Number},
                                            {"Member", ArgumentType::Text},
                                            {"daysMustKeepPassword", ArgumentType::Number},
                                            {"daysMustChangePasswordAfter", ArgumentType::Number},
                                            {"daysWarnBeforePasswordExpire", ArgumentType::Number},
                                            {"daysExpireAfter", ArgumentType::Number},
                                            {"PasswordExpiration", ArgumentType::DateTime}}};

constexpr unsigned bit(Field field) { return 1u << field; }

constexpr unsigned kNameOnly = bit(kName);
constexpr unsigned kAccountFields = bit(kFullName) | bit(kUserId) | bit(kGroupId) |
                                    bit(kHomeDirectory) | bit(kScriptPath) | bit(kUserPassword) |
                                    bit(kCreateHome);
constexpr unsigned kAgeingFields = bit(kMinimumDays) | bit(kMaximumDays) | bit(kWarningDays) |
                                   bit(kInactiveDays) | bit(kExpiration);

struct MethodRow {
    const char* name;
    Method method;
    unsigned needed;
    unsigned optional;
};

// In the order of Method.
constexpr std::array<MethodRow, 10> kMethods{
    {{"CreateUser", Method::CreateUser, kNameOnly, kAccountFields},
     {"ModifyUser", Method::ModifyUser, kNameOnly, kAccountFields | kAgeingFields},
     {"DeleteUser", Method::DeleteUser, kNameOnly, bit(kRemoveHome)},
     {"SetPassword", Method::SetPassword, kNameOnly | bit(kUserPassword), 0},
     {"EnableUser", Method::EnableUser, kNameOnly, 0},
     {"DisableUser", Method::DisableUser, kNameOnly, 0},
     {"CreateGroup", Method::CreateGroup, kNameOnly, bit(kGroupId)},
     {"DeleteGroup", Method::DeleteGroup, kNameOnly, 0},
     {"AddMember", Method::AddMember, kNameOnly | bit(kMember), 0},
     {"RemoveMember", Method::RemoveMember, kNameOnly | bit(kMember), 0}}};

bool createsName(Method method) {
    return method == Method::CreateUser || method == Method::CreateGroup;
}

template <typename T> Problem keep(const Attempt<T>& value, std::optional<T>& field) {
    if (!value) {
        return value.reason();
    }
    field = *value;
    return {};
}

Problem keepNumber(std::string_view text, std::optional<std::uint32_t>& field) {
    return keep(parseNumber(text), field);
}

Problem keepFlag(std::string_view text, std::optional<bool>& field) {
    if (text != "0" && text != "1") {
        return "is neither 0 nor 1";
    }
    field = text == "1";
    return {};
}

template <typename Check>
Problem keepText(std::string_view text, Check check, std::optional<std::string>& field) {
    field = std::string(text);
    return check(text);
}

Problem keepPassword(std::string_view text, std::optional<Secret>& field) {
    field = Secret(text);
    return checkPassword(text);
}

Problem keepName(std::string_view text, CommandRequest& request) {
    request.name = std::string(text);
    return createsName(request.method) ? checkNewName(text) : checkExistingName(text);
}

Problem keepValue(Field field, std::string_view text, CommandRequest& request) {
    switch (field) {
    case kName:
        return keepName(text, request);
    case kFullName:
        return keepText(text, checkFullName, request.fullName);
    case kUserId:
        return keepNumber(text, request.uid);
    case kGroupId:
        return keepNumber(text, request.gid);
    case kHomeDirectory:
        return keepText(text, checkPath, request.home);
    case kScriptPath:
        return keepText(text, checkPath, request.shell);
    case kUserPassword:
        return keepPassword(text, request.password);
    case kCreateHome:
        return keepFlag(text, request.createHome);
    case kRemoveHome:
        return keepFlag(text, request.removeHome);
    case kMember:
        return keepText(text, checkExistingName, request.member);
    case kMinimumDays:
        return keepNumber(text, request.ageing.minimum);
    case kMaximumDays:
        return keepNumber(text, request.ageing.maximum);
    case kWarningDays:
        return keepNumber(text, request.ageing.warning);
    case kInactiveDays:
        return keepNumber(text, request.ageing.inactive);
    case kExpiration:
        return keep(dayOfDateTime(text), request.ageing.expiry);
    }
    return "is unknown";
}

// Stores one argument and marks it in `given`. Names that are no argument of the method are
// not repeated in the reason: they may be the end of a password that held a comma.
Problem keepArgument(const MethodRow& method, const CommandArgument& argument, unsigned& given,
                     CommandRequest& request) {
    const auto row = std::find_if(kFields.begin(), kFields.end(), [&](const FieldRow& field) {
        return field.name == argument.name;
    });
    const auto field = static_cast<Field>(row - kFields.begin());
    if (row == kFields.end() || ((method.needed | method.optional) & bit(field)) == 0) {
        return "an argument is none of this method's";
    }
    if ((given & bit(field)) != 0) {
        return std::string(row->name) + " is given twice";
    }
    if (argument.type != row->type) {
        return std::string(row->name) + " has the wrong type";
    }
    given |= bit(field);
    if (Problem problem = keepValue(field, argument.value, request)) {
        return std::string(row->name) + " " + *problem;
    }
    return {};
}

} // namespace

const char* nameOf(Method method) { return kMethods.at(static_cast<std::size_t>(method)).name; }

Attempt<CommandRequest> parseCommandRequest(const CommandText& command) {
    const auto method = std::find_if(kMethods.begin(), kMethods.end(), [&](const MethodRow& row) {
        return row.name == command.method;
    });
    if (method == kMethods.end()) {
        return Refusal{"the method is unknown"};
    }
    CommandRequest request;
    request.method = method->method;
    unsigned given = 0;
    for (const CommandArgument& argument : command.arguments) {
        if (Problem problem = keepArgument(*method, argument, given, request)) {
            return Refusal{std::string(method->name) + ": " + *problem};
        }
    }
    if ((method->needed & ~given) != 0) {
        return Refusal{std::string(method->name) + ": an argument is missing"};
    }
    return request;
}

} // namespace qelo::store
