#include "common/CmpiRead.h"

namespace qelo::platform {
namespace {

const char* charactersOf(const CMPIString* string) {
    if (!isLive(string) || string->ft->getCharPtr == nullptr) {
        return nullptr;
    }
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const char* characters = string->ft->getCharPtr(string, &status);
    return status.rc == CMPI_RC_OK ? characters : nullptr;
}

bool isUsable(const CMPIStatus& status, const CMPIData& data) {
    return status.rc == CMPI_RC_OK && (data.state & (CMPI_badValue | CMPI_notFound)) == 0;
}

} // namespace

std::optional<std::string_view> textOf(const CMPIString* string) {
    const char* characters = charactersOf(string);
    return characters == nullptr ? std::nullopt : std::optional<std::string_view>(characters);
}

std::optional<std::string_view> classNameOf(const CMPIObjectPath* path) {
    if (!isLive(path) || path->ft->getClassName == nullptr) {
        return std::nullopt;
    }
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const CMPIString* name = path->ft->getClassName(path, &status);
    return status.rc == CMPI_RC_OK ? textOf(name) : std::nullopt;
}

std::optional<CMPICount> keyCountOf(const CMPIObjectPath* path) {
    if (!isLive(path) || path->ft->getKeyCount == nullptr) {
        return std::nullopt;
    }
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const CMPICount count = path->ft->getKeyCount(path, &status);
    return status.rc == CMPI_RC_OK ? std::optional<CMPICount>(count) : std::nullopt;
}

std::optional<Key> keyAt(const CMPIObjectPath* path, CMPICount position) {
    if (!isLive(path) || path->ft->getKeyAt == nullptr) {
        return std::nullopt;
    }
    CMPIStatus status{CMPI_RC_OK, nullptr};
    CMPIString* name = nullptr;
    const CMPIData data = path->ft->getKeyAt(path, position, &name, &status);
    const char* characters = charactersOf(name);
    if (characters == nullptr || !isUsable(status, data)) {
        return std::nullopt;
    }
    return Key{characters, data};
}

std::optional<CMPIData> keyNamed(const CMPIObjectPath* path, const char* name) {
    if (!isLive(path) || path->ft->getKey == nullptr) {
        return std::nullopt;
    }
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const CMPIData data = path->ft->getKey(path, name, &status);
    return isUsable(status, data) ? std::optional<CMPIData>(data) : std::nullopt;
}

std::optional<std::string_view> textOf(const CMPIDateTime* dateTime) {
    if (!isLive(dateTime) || dateTime->ft->getStringFormat == nullptr) {
        return std::nullopt;
    }
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const CMPIString* text = dateTime->ft->getStringFormat(dateTime, &status);
    return status.rc == CMPI_RC_OK ? textOf(text) : std::nullopt;
}

} // namespace qelo::platform
