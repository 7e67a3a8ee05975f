#include "SimGroup.h"

#include "../store/RecordLoader.h"

#include <ProviderException.h>
#include <UnitTrace.h>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

// The component of the whole provider, shared by this unit and the factory's.
const std::string loggerSimGroup("Corvane.SimpleIdentityManagementProvider");
const UnitTrace unit(loggerSimGroup, "SimGroup");

std::string joined(const std::vector<std::string>& members) {
    std::string text;
    for (const std::string& member : members) {
        text += member;
        text += ',';
    }
    if (!text.empty()) {
        text.pop_back();
    }
    return text;
}

void fillGroup(Instrumentation& node, SimGroup& group) {
    std::string name;
    if (node.getProperty(NodeLexicon::Name, name)) {
        if (group.setName(name)) {
            throw ProviderException("Failed while setting Name");
        }
        if (group.setElementName(name)) {
            throw ProviderException("Failed while setting Element Name");
        }
    }
    std::vector<std::string> members;
    if (node.getProperty(NodeLexicon::GroupMembers, members)) {
        group.setMembers(joined(members));
    }
}

} // namespace

SimGroup::SimGroup() { unit.method(); }

SimGroup::~SimGroup() { unit.methodQuietly(); }

std::string SimGroup::getName() { return unit.read("_name", _name); }
std::string SimGroup::getElementName() { return unit.read("_elementName", _elementName); }
std::string SimGroup::getMembers() { return unit.read("_members", _members); }

bool SimGroup::setName(std::string name) {
    return unit.assign(" name=", "_name", _name, std::move(name));
}
bool SimGroup::setElementName(std::string elementName) {
    return unit.assign(" elementName=", "_elementName", _elementName, std::move(elementName));
}
bool SimGroup::setMembers(std::string member) {
    return unit.assign(" member=", "_members", _members, std::move(member));
}

bool setVector(std::vector<SimGroup>& vectSimGroup, Tesk::Instrumentation& instrumentation) {
    CallTrace call(unit, parameters(" vectSimGroup=", &vectSimGroup,
                                    " instrumentation=", static_cast<bool>(instrumentation)));
    appendRecords(instrumentation, vectSimGroup, fillGroup);
    return call.leave(false);
}

bool getSimGroupInstances(std::vector<SimGroup>& vectSimGroup) {
    CallTrace call(unit, parameters(" vectSimGroup=", &vectSimGroup));
    bool failed = true;
    try {
        Instrumentation cursor;
        cursor.selectNode(NodeLexicon::UserGroup);
        if (cursor) {
            setVector(vectSimGroup, cursor);
            failed = false;
        }
    } catch (const std::exception& failure) {
        unit.message(failure.what());
    }
    return call.leave(failed);
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
