#include "WatchedResult.h"

#include <set>

namespace qelo::test {

namespace {

const WatchedResult& watched(const CMPIResult* self) {
    return *static_cast<const WatchedResult*>(self->hdl);
}

bool isCallOf(const std::string& call, const char* slot) { return call.rfind(slot, 0) == 0; }

std::string withoutFault(const std::string& call) { return call.substr(0, call.rfind(" [fault]")); }

} // namespace

WatchedResult::WatchedResult(const CMPIResult* real) : table_(*real->ft), cmpi_(), real_(real) {
    table_.returnInstance = returnInstance;
    table_.returnObjectPath = returnObjectPath;
    table_.returnData = returnData;
    table_.returnDone = returnDone;
    cmpi_.hdl = this;
    cmpi_.ft = &table_;
}

bool WatchedResult::gotOneTwice() const {
    return std::set<const void*>(given_.begin(), given_.end()).size() != given_.size();
}

CMPIStatus WatchedResult::returnInstance(const CMPIResult* self, const CMPIInstance* instance) {
    const WatchedResult& result = watched(self);
    result.given_.push_back(instance);
    return result.real_->ft->returnInstance(result.real_, instance);
}

CMPIStatus WatchedResult::returnObjectPath(const CMPIResult* self, const CMPIObjectPath* path) {
    const WatchedResult& result = watched(self);
    result.given_.push_back(path);
    return result.real_->ft->returnObjectPath(result.real_, path);
}

CMPIStatus WatchedResult::returnData(const CMPIResult* self, const CMPIValue* value,
                                     CMPIType type) {
    const CMPIResult* const real = watched(self).real_;
    return real->ft->returnData(real, value, type);
}

CMPIStatus WatchedResult::returnDone(const CMPIResult* self) {
    const CMPIResult* const real = watched(self).real_;
    return real->ft->returnDone(real);
}

std::vector<std::string> madeTwice(const std::vector<std::string>& calls) {
    std::set<std::string> made;
    std::vector<std::string> again;
    std::string instance;
    const auto take = [&] {
        if (!instance.empty() && !made.insert(instance).second) {
            again.push_back(instance);
        }
        instance.clear();
    };
    unsigned int paths = 0;
    for (const std::string& call : calls) {
        if (isCallOf(call, "newInstance")) {
            take();
            paths = 0;
        } else if (isCallOf(call, "setProperty(")) {
            instance += withoutFault(call) + "\n";
        } else if (isCallOf(call, "returnObjectPath") && ++paths > 1) {
            again.push_back(instance + call);
        }
    }
    take();
    return again;
}

} // namespace qelo::test
