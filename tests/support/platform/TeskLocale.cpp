#include "RecordingPort.h"

#include <platform/TeskLocale.h>

using qelo::test::RecordingPort;

namespace Tesk {

struct ResourceString::Text {
    std::wstring value;
};

std::string Locale::getLanguageId() { return RecordingPort::language(); }

std::wstring Locale::getResourceLibrary(unsigned long number, std::string languageId) {
    return RecordingPort::library(number, languageId);
}

ResourceString::ResourceString(const std::wstring& library, const std::wstring& id)
    : text_(new Text{RecordingPort::text(library, id)}) {}

ResourceString::~ResourceString() { delete text_; }

ResourceString::operator std::wstring() const { return text_->value; }

} // namespace Tesk
