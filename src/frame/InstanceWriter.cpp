#include "InstanceWriter.h"

#include <platform/TeskCommon.h>
#include <platform/TeskLocale.h>

#include <algorithm>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

constexpr unsigned long managementResources = 2;
constexpr const wchar_t* captionId = L"MSGID_SIMPLE_ID_MANAGEMENT_CAPTION";

} // namespace

PropertyFilter::PropertyFilter(const char** properties, NullList nullList)
    : everything_(properties == nullptr && nullList == NullList::Everything) {
    if (properties == nullptr) {
        return;
    }
    // Names are counted in 16 bits; a list that long ends there.
    for (std::uint16_t i = 0; properties[i] != nullptr && i != UINT16_MAX; ++i) {
        names_.emplace_back(properties[i]);
    }
}

bool PropertyFilter::wants(const char* name) const {
    return everything_ || std::find(names_.begin(), names_.end(), name) != names_.end();
}

CMPIInstance* newInstance(const CMPIBroker* broker, const CMPIObjectPath* ref,
                          const char* className, CMPIStatus* lookup) {
    const CMPIObjectPath* path = newPath(broker, ref, className, lookup, nullptr);
    if (path == nullptr) {
        return nullptr;
    }
    CMPIInstance* instance = broker->eft->newInstance(broker, path, nullptr);
    return isNull(instance) ? nullptr : instance;
}

void InstanceWriter::set(const char* name, const CMPIValue& value, CMPIType type) const {
    instance_->ft->setProperty(instance_, name, &value, type);
}

void InstanceWriter::chars(const char* name, const std::string& text) const {
    instance_->ft->setProperty(instance_, name, charsValue(text.c_str()), CMPI_chars);
}

void InstanceWriter::boolean(const char* name, bool value) const {
    CMPIValue cmpi = {};
    cmpi.boolean = value;
    set(name, cmpi, CMPI_boolean);
}

void InstanceWriter::uint16(const char* name, std::uint16_t value) const {
    CMPIValue cmpi = {};
    cmpi.uint16 = value;
    set(name, cmpi, CMPI_uint16);
}

void InstanceWriter::uint32(const char* name, std::uint32_t value) const {
    CMPIValue cmpi = {};
    cmpi.uint32 = value;
    set(name, cmpi, CMPI_uint32);
}

void InstanceWriter::dateTime(const char* name, const std::string& text) const {
    CMPIValue cmpi = {};
    cmpi.dateTime = broker_->eft->newDateTimeFromChars(broker_, text.c_str(), nullptr);
    if (isNull(cmpi.dateTime)) {
        instance_->ft->setProperty(instance_, name, nullptr, CMPI_dateTime);
        return;
    }
    set(name, cmpi, CMPI_dateTime);
}

CMPIArray* InstanceWriter::newArray(std::size_t size, CMPIType type, CMPIStatus* status) const {
    CMPIArray* array = broker_->eft->newArray(broker_, static_cast<CMPICount>(size), type, status);
    return isNull(array) ? nullptr : array;
}

void InstanceWriter::strings(const char* name, const std::vector<std::string>& texts) const {
    CMPIValue array = {};
    array.array = newArray(texts.size(), CMPI_string, nullptr);
    if (array.array == nullptr) {
        return;
    }
    for (std::size_t i = 0; i < texts.size(); ++i) {
        CMPIValue element = {};
        element.string = broker_->eft->newString(broker_, texts[i].c_str(), nullptr);
        if (isNull(element.string)) {
            return;
        }
        array.array->ft->setElementAt(array.array, static_cast<CMPICount>(i), &element,
                                      CMPI_string);
    }
    set(name, array, CMPI_stringA);
}

bool InstanceWriter::uint16Array(const char* name, const std::vector<std::uint16_t>& values,
                                 CMPIStatus* created) const {
    CMPIValue array = {};
    array.array = newArray(values.size(), CMPI_uint16, created);
    if (array.array == nullptr) {
        return false;
    }
    for (std::size_t i = 0; i < values.size(); ++i) {
        CMPIValue element = {};
        element.uint16 = values[i];
        array.array->ft->setElementAt(array.array, static_cast<CMPICount>(i), &element,
                                      CMPI_uint16);
    }
    set(name, array, CMPI_uint16A);
    return true;
}

std::string localisedCaption() {
    const std::string language = Locale::getLanguageId();
    const std::wstring library = Locale::getResourceLibrary(managementResources, language);
    const ResourceString caption(library, captionId);
    return make_string(caption);
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
