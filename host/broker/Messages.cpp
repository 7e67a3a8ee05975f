#include "Messages.h"

#include "Broker.h"
#include "Frame.h"
#include "Slot.h"

#include <array>
#include <cstdarg>
#include <cstdio>
#include <memory>

namespace qelo::broker {
namespace {

constexpr CMPICount maximumArguments = 10;

struct MessageArguments {
    std::array<std::string, maximumArguments> texts;
    CMPICount count = 0;
};

std::string realText(double value) {
    std::array<char, 64> buffer = {};
    (void)std::snprintf(buffer.data(), buffer.size(), "%g", value);
    return buffer.data();
}

// One value of the list. The caller pushed it with the C type that belongs to `type`.
std::string nextArgument(int type, va_list* list) {
    switch (type) {
    case CMPI_sint32:
        return std::to_string(va_arg(*list, long));
    case CMPI_uint32:
        return std::to_string(va_arg(*list, unsigned long));
    case CMPI_sint64:
        return std::to_string(va_arg(*list, long long));
    case CMPI_uint64:
        return std::to_string(va_arg(*list, unsigned long long));
    case CMPI_real64:
        return realText(va_arg(*list, double));
    case CMPI_boolean:
        return va_arg(*list, int) != 0 ? "true" : "false";
    case CMPI_chars: {
        const char* text = va_arg(*list, const char*);
        return text ? text : "";
    }
    case CMPI_string: {
        const CMPIString* text = va_arg(*list, const CMPIString*);
        return text ? std::string(alive<StringObject>(text).view()) : std::string();
    }
    default:
        throw Refusal{CMPI_RC_ERR_TYPE_MISMATCH};
    }
}

MessageArguments readArguments(CMPICount count, va_list* list) {
    if (count > maximumArguments) {
        throw Refusal{CMPI_RC_ERR_INVALID_PARAMETER};
    }
    MessageArguments arguments;
    for (; arguments.count < count; ++arguments.count) {
        const int type = va_arg(*list, int);
        arguments.texts[arguments.count] = nextArgument(type, list);
    }
    return arguments;
}

// A $n without an argument stays as it is.
std::string expand(const std::string& pattern, const MessageArguments& arguments) {
    std::string text;
    for (std::size_t i = 0; i < pattern.size(); ++i) {
        const char next = i + 1 < pattern.size() ? pattern[i + 1] : '\0';
        if (pattern[i] == '$' && next >= '0' && next <= '9' &&
            static_cast<CMPICount>(next - '0') < arguments.count) {
            text += arguments.texts[static_cast<std::size_t>(next - '0')];
            ++i;
        } else {
            text += pattern[i];
        }
    }
    return text;
}

// The translation if there is one, else the default text.
std::string patternOf(const Broker& broker, CMPIMsgFileHandle file, const char* messageId,
                      const char* defaultText) {
    std::string fallback = defaultText ? defaultText : "";
    if (!file) {
        return fallback;
    }
    const auto catalog = broker.catalog(file);
    if (!catalog) {
        throw Refusal{CMPI_RC_ERR_INVALID_HANDLE};
    }
    return catalog->text(messageId ? messageId : "").value_or(fallback);
}

CMPIString* callString(std::string_view text) {
    return &newString(currentArena(), text, Ownership::Call)->cmpi;
}

// Whatever goes wrong with the arguments, the caller still gets a text.
CMPIString* message(const CMPIBroker* mb, CMPIMsgFileHandle file, const char* messageId,
                    const char* defaultText, CMPIStatus* st, CMPICount count, va_list* list) {
    CMPIString* unexpanded = slot<CMPIString*>(
        nullptr, nullptr, [&] { return callString(defaultText ? defaultText : ""); });
    return slot(st, unexpanded, [&] {
        const std::string pattern = patternOf(aliveBroker(mb), file, messageId, defaultText);
        return callString(expand(pattern, readArguments(count, list)));
    });
}

} // namespace

// NOLINTBEGIN(cert-dcl50-cpp): CMPI has it so.
CMPIString* getMessage(const CMPIBroker* mb, const char* messageId, const char* defaultText,
                       CMPIStatus* st, CMPICount count, ...) {
    va_list list;
    va_start(list, count);
    CMPIString* text = message(mb, nullptr, messageId, defaultText, st, count, &list);
    va_end(list);
    return text;
}

CMPIString* getMessage2(const CMPIBroker* mb, const char* messageId, CMPIMsgFileHandle file,
                        const char* defaultText, CMPIStatus* st, CMPICount count, ...) {
    va_list list;
    va_start(list, count);
    CMPIString* text = message(mb, file, messageId, defaultText, st, count, &list);
    va_end(list);
    return text;
}

// NOLINTEND(cert-dcl50-cpp)

CMPIStatus openMessageFile(const CMPIBroker* mb, const char* file, CMPIMsgFileHandle* handle) {
    if (handle) {
        *handle = nullptr;
    }
    return statusSlot([&] {
        Broker& broker = aliveBroker(mb);
        const std::string_view given = givenName(file);
        if (!handle) {
            throw Refusal{CMPI_RC_ERR_INVALID_PARAMETER};
        }
        *handle = broker.openCatalog(std::string(given));
        if (!*handle) {
            throw Refusal{CMPI_RC_ERR_NOT_FOUND};
        }
    });
}

CMPIStatus closeMessageFile(const CMPIBroker* mb, CMPIMsgFileHandle handle) {
    return statusSlot([&] {
        Broker& broker = aliveBroker(mb);
        if (handle && !broker.closeCatalog(handle)) {
            throw Refusal{CMPI_RC_ERR_INVALID_HANDLE};
        }
    });
}

} // namespace qelo::broker
