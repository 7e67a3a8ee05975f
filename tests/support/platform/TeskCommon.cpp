#include "RecordingPort.h"

#include <platform/TeskCommon.h>

#include <cmpidt.h>
#include <cmpift.h>

#include <cstring>
#include <strings.h>
#include <utility>

using qelo::test::RecordingPort;

namespace Tesk {

namespace {

std::string textOf(const CMPIString* text) {
    if (text == nullptr || text->hdl == nullptr) {
        return "";
    }
    const char* characters = text->ft->getCharPtr(text, nullptr);
    return characters != nullptr ? characters : "";
}

bool isText(CMPIType type) { return type == CMPI_string; }

bool sameValue(const CMPIData& wanted, const CMPIData& given) {
    if (wanted.type != given.type) {
        return false;
    }
    if (isText(wanted.type)) {
        return textOf(wanted.value.string) == textOf(given.value.string);
    }
    if (wanted.type == CMPI_ref) {
        return isObjPathsEqual(wanted.value.ref, given.value.ref, false);
    }
    return wanted.value.uint64 == given.value.uint64;
}

bool hasKey(const CMPIObjectPath* path, const char* name, const CMPIData& wanted) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const CMPIData given = path->ft->getKey(path, name, &status);
    return status.rc == CMPI_RC_OK && (given.state & CMPI_nullValue) == 0 &&
           sameValue(wanted, given);
}

bool isNothing(const CMPIObjectPath* path) { return path == nullptr || path->hdl == nullptr; }

bool sameObject(const CMPIObjectPath* wanted, const CMPIObjectPath* path, bool strict) {
    if (isNothing(wanted) || isNothing(path) ||
        strcasecmp(textOf(wanted->ft->getClassName(wanted, nullptr)).c_str(),
                   textOf(path->ft->getClassName(path, nullptr)).c_str()) != 0) {
        return false;
    }
    const CMPICount count = wanted->ft->getKeyCount(wanted, nullptr);
    for (CMPICount i = 0; i < count; ++i) {
        CMPIString* name = nullptr;
        const CMPIData value = wanted->ft->getKeyAt(wanted, i, &name, nullptr);
        if (!hasKey(path, textOf(name).c_str(), value)) {
            return false;
        }
    }
    return !strict || count == path->ft->getKeyCount(path, nullptr);
}

void appendUtf8(std::string& text, char32_t character) {
    const auto tail = [&](unsigned int shift) {
        text += static_cast<char>(0x80U | ((character >> shift) & 0x3FU));
    };
    if (character < 0x80) {
        text += static_cast<char>(character);
    } else if (character < 0x800) {
        text += static_cast<char>(0xC0U | (character >> 6U));
        tail(0);
    } else if (character < 0x10000) {
        text += static_cast<char>(0xE0U | (character >> 12U));
        tail(6);
        tail(0);
    } else {
        text += static_cast<char>(0xF0U | (character >> 18U));
        tail(12);
        tail(6);
        tail(0);
    }
}

} // namespace

std::string getSystemName() { return RecordingPort::systemName(); }

bool isObjPathsEqual(const CMPIObjectPath* wanted, const CMPIObjectPath* path, bool strict) {
    const std::optional<bool> scripted = RecordingPort::scriptedComparison();
    const bool equal = scripted ? *scripted : sameObject(wanted, path, strict);
    RecordingPort::pathsCompared({wanted, strict, equal});
    return equal;
}

std::string make_string(const std::wstring& text) {
    std::string narrow;
    for (const wchar_t character : text) {
        appendUtf8(narrow, static_cast<char32_t>(character));
    }
    return RecordingPort::narrow(std::move(narrow));
}

} // namespace Tesk
