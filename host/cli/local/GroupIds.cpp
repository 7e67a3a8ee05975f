#include "GroupIds.h"

#include <Instrumentation.h>

namespace qelo::cli {

std::map<std::string, std::string> localGroupIds() {
    std::map<std::string, std::string> ids;
    Tesk::Instrumentation groups;
    groups.selectNode(Tesk::NodeLexicon::UserGroup);
    for (; groups; ++groups) {
        std::string name;
        std::string id;
        if (groups.getProperty(Tesk::NodeLexicon::Name, name) &&
            groups.getProperty(Tesk::NodeLexicon::GroupId, id)) {
            ids.emplace(name, id);
        }
    }
    return ids;
}

} // namespace qelo::cli
