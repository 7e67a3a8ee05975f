#include "platform/TeskLocale.h"

#include "locale/ResourceTexts.h"

namespace Tesk {

struct ResourceString::Text {
    std::shared_ptr<const std::wstring> wide;
};

ResourceString::ResourceString(const std::wstring& library, const std::wstring& id)
    : text_(new Text{qelo::locale::resourceText(library, id)}) {}

ResourceString::~ResourceString() { delete text_; }

ResourceString::operator std::wstring() const { return *text_->wide; }

} // namespace Tesk
