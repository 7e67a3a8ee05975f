#include "NewMailFile.h"

#include <cerrno>

namespace qelo::store {

NewMailFile::NewMailFile(const Workplace& workplace, const std::string& mailDirectory,
                         const std::string& name)
    : workplace_(workplace) {
    Attempt<Place> place = findInRoot(workplace, mailDirectory + "/" + name);
    if (!place || !place->hasParent()) {
        return;
    }
    struct stat status {};
    if (!workplace.files.statusAt(place->parent.get(), place->name, status) && errno == ENOENT) {
        place_ = std::move(*place);
    }
}

Problem NewMailFile::undo() {
    struct stat status {};
    if (!place_ || !workplace_.files.statusAt(place_->parent.get(), place_->name, status) ||
        !S_ISREG(status.st_mode) || status.st_size != 0) {
        return {};
    }
    return workplace_.files.removeFile(place_->parent.get(), place_->name)
               ? Problem()
               : Problem("an empty mail file stays");
}

} // namespace qelo::store
