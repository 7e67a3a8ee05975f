#include "SimGroupObjFactory.h"

#include "../store/RefreshHandshake.h"

#include <ClassNames.h>

#include <iterator>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimGroupObjFactory("Corvane.SimpleIdentityManagementProvider");
const UnitTrace unit(loggerSimGroupObjFactory, "SimGroupObjFactory");

constexpr KeyRow<SimGroup> keys[] = {
    {"CreationClassName", key::fixed<GroupClass>},
    {"Name", key::text<&SimGroup::getName>},
};

using namespace property;

constexpr PropertyRow<SimGroup, SimGroupFactory> table[] = {
    {"Caption", caption},
    {"Description", chars<&SimGroup::getElementName>},
    {"ElementName", chars<&SimGroup::getElementName>},
    {"GroupMembers", chars<&SimGroup::getMembers>},
};

} // namespace

const SimGroupFactory::Shape& SimGroupFactory::shape() {
    static const Shape shape = {
        unit,
        GroupClass,
        "SimGroupProvider",
        getSimGroupInstances,
        &SimGroup::getName,
        SameKey::IsDropped,
        keys,
        table,
        std::size(table),
        1,
        "Create CMPIObjectPath failed.",
        "Create CMPIObjectPath                     failed for RecordLogClass.",
        " simGroup=",
        " isObjPath=",
        true,
        false,
        1,
        {false, false, false}};
    return shape;
}

SimGroupFactory::SimGroupFactory() { unit.method(); }

SimGroupFactory::SimGroupFactory(bool, bool) {
    unit.entering();
    load();
    unit.exiting();
}

SimGroupFactory::~SimGroupFactory() { unit.methodQuietly(); }

void refreshGroupNode() {
    const TraceSite site = TraceSite::here();
    try {
        requestRefreshWhenStale(NodeLexicon::UserGroup,
                                [&](unsigned int user_sz, unsigned int nodeSize) {
                                    unit.variable("nodeSize", nodeSize, site);
                                    unit.variable("user_sz", user_sz, site);
                                });
    } catch (const std::exception& failure) {
        unit.message(failure.what());
    }
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
