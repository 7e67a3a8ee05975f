#include "FakePath.h"

#include <strings.h>

namespace qelo::test {

Fault Faults::fault_ = Fault::NullResult;
int Faults::failing_ = 0;
int Faults::calls_ = 0;

void Faults::arm(Fault fault, int call) {
    fault_ = fault;
    failing_ = call;
    calls_ = 0;
}

bool Faults::strikes() { return ++calls_ == failing_; }

// The slots of the function tables; each is a member so that it reaches into its object.
struct Slots {
    static const CMPIStringFT stringTable;
    static const CMPIDateTimeFT dateTimeTable;
    static const CMPIObjectPathFT pathTable;

    template <typename Owner, typename Object> static const Owner& owner(const Object* object) {
        return *static_cast<const Owner*>(object->hdl);
    }

    static void succeed(CMPIStatus* status) {
        if (status != nullptr) {
            *status = {CMPI_RC_OK, nullptr};
        }
    }

    static void fail(CMPIStatus* status) {
        if (status != nullptr) {
            *status = {CMPI_RC_ERR_FAILED, nullptr};
        }
    }

    static CMPIString* give(const FakeString& string, CMPIStatus* status);
    static CMPIData noKey(CMPIStatus* status);

    static const char* getCharPtr(const CMPIString* string, CMPIStatus* status);
    static CMPIString* getStringFormat(const CMPIDateTime* dateTime, CMPIStatus* status);
    static CMPIString* getClassName(const CMPIObjectPath* path, CMPIStatus* status);
    static CMPIData getKey(const CMPIObjectPath* path, const char* name, CMPIStatus* status);
    static CMPIData getKeyAt(const CMPIObjectPath* path, CMPICount index, CMPIString** name,
                             CMPIStatus* status);
    static CMPICount getKeyCount(const CMPIObjectPath* path, CMPIStatus* status);

    static CMPIStringFT makeStringTable();
    static CMPIDateTimeFT makeDateTimeTable();
    static CMPIObjectPathFT makePathTable();
};

CMPIStringFT Slots::makeStringTable() {
    CMPIStringFT table{};
    table.getCharPtr = getCharPtr;
    return table;
}

CMPIDateTimeFT Slots::makeDateTimeTable() {
    CMPIDateTimeFT table{};
    table.getStringFormat = getStringFormat;
    return table;
}

CMPIObjectPathFT Slots::makePathTable() {
    CMPIObjectPathFT table{};
    table.getClassName = getClassName;
    table.getKey = getKey;
    table.getKeyAt = getKeyAt;
    table.getKeyCount = getKeyCount;
    return table;
}

const CMPIStringFT Slots::stringTable = makeStringTable();
const CMPIDateTimeFT Slots::dateTimeTable = makeDateTimeTable();
const CMPIObjectPathFT Slots::pathTable = makePathTable();

CMPIString* Slots::give(const FakeString& string, CMPIStatus* status) {
    static CMPIString dead{nullptr, &stringTable};
    static const CMPIStringFT emptyTable{};
    static CMPIString slotless{&dead, &emptyTable};
    succeed(status);
    auto* object = const_cast<CMPIString*>(&string.object_);
    if (!Faults::strikes()) {
        return object;
    }
    switch (Faults::kind()) {
    case Fault::NullResult:
        return nullptr;
    case Fault::DeadHandle:
        return &dead;
    case Fault::MissingSlot:
        return &slotless;
    case Fault::FailureStatus:
        break;
    }
    fail(status);
    return object;
}

// A failure as brokers report it; each kind of fault, since data has no null result.
CMPIData Slots::noKey(CMPIStatus* status) {
    CMPIData data{};
    data.type = CMPI_string;
    switch (Faults::kind()) {
    case Fault::NullResult:
        data.state = CMPI_nullValue;
        break;
    case Fault::DeadHandle:
        data.state = CMPI_badValue;
        break;
    case Fault::MissingSlot:
        data.state = CMPI_notFound | CMPI_nullValue;
        break;
    case Fault::FailureStatus:
        fail(status);
        break;
    }
    return data;
}

const char* Slots::getCharPtr(const CMPIString* string, CMPIStatus* status) {
    const char* text = owner<FakeString>(string).text_.c_str();
    succeed(status);
    if (!Faults::strikes()) {
        return text;
    }
    fail(status);
    return Faults::kind() == Fault::FailureStatus ? text : nullptr;
}

CMPIString* Slots::getStringFormat(const CMPIDateTime* dateTime, CMPIStatus* status) {
    return give(owner<FakeDateTime>(dateTime).text_, status);
}

CMPIString* Slots::getClassName(const CMPIObjectPath* path, CMPIStatus* status) {
    return give(owner<FakePath>(path).className_, status);
}

CMPIData Slots::getKey(const CMPIObjectPath* path, const char* name, CMPIStatus* status) {
    succeed(status);
    if (Faults::strikes()) {
        return noKey(status);
    }
    for (const auto& key : owner<FakePath>(path).keys_) {
        if (::strcasecmp(key.plainName.c_str(), name) == 0) {
            return key.data;
        }
    }
    *status = {CMPI_RC_ERR_NO_SUCH_PROPERTY, nullptr};
    CMPIData data{};
    data.state = CMPI_nullValue;
    return data;
}

CMPIData Slots::getKeyAt(const CMPIObjectPath* path, CMPICount index, CMPIString** name,
                         CMPIStatus* status) {
    const auto& key = owner<FakePath>(path).keys_.at(index);
    *name = give(key.name, status);
    return Faults::strikes() ? noKey(status) : key.data;
}

CMPICount Slots::getKeyCount(const CMPIObjectPath* path, CMPIStatus* status) {
    succeed(status);
    if (Faults::strikes()) {
        fail(status);
        return 0;
    }
    return static_cast<CMPICount>(owner<FakePath>(path).keys_.size());
}

FakeString::FakeString(std::string text)
    : text_(std::move(text)), object_{this, &Slots::stringTable} {}

FakeDateTime::FakeDateTime(const std::string& text)
    : text_(text), object_{this, &Slots::dateTimeTable} {}

FakePath::FakePath(const std::string& className)
    : className_(className), object_{this, &Slots::pathTable} {}

FakePath& FakePath::add(const std::string& name, CMPIType type, CMPIValue value,
                        CMPIValueState state) {
    CMPIData data{};
    data.type = type;
    data.state = state;
    data.value = value;
    keys_.emplace_back(name, data);
    return *this;
}

FakePath& FakePath::addText(const std::string& name, const std::string& text) {
    CMPIValue value{};
    value.string = texts_.emplace_back(text).get();
    return add(name, CMPI_string, value);
}

FakePath& FakePath::addDate(const std::string& name, const std::string& text) {
    CMPIValue value{};
    value.dateTime = dates_.emplace_back(text).get();
    return add(name, CMPI_dateTime, value);
}

FakePath& FakePath::addReference(const std::string& name, const FakePath& path) {
    CMPIValue value{};
    value.ref = const_cast<CMPIObjectPath*>(path.get());
    return add(name, CMPI_ref, value);
}

} // namespace qelo::test
