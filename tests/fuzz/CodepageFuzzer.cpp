// The code page conversion with any bytes and lengths: it stays inside its buffers, whatever
// the code page of the process is. And wide texts: they become UTF-8.
#include "FuzzInput.h"

#include <account/SimAccountObjFactory.h>
#include <cim/Utf8.h>
#include <platform/TeskCommon.h>

#include <unicode/ucnv.h>

#include <algorithm>
#include <array>
#include <cstring>
#include <memory>

namespace {

using qelo::fuzz::require;

constexpr std::array<const char*, 6> codepages = {"UTF-8",    "ISO-8859-1",  "Shift_JIS",
                                                  "UTF-16LE", "ISO-2022-JP", "IBM1047"};

constexpr char untouched = '#';

// The source ends where its buffer does, so that a byte too many is seen.
std::string convert(std::string_view text, unsigned int targetLength, unsigned int sourceLength) {
    const auto source = std::make_unique<char[]>(text.size());
    text.copy(source.get(), text.size());
    const auto target = std::make_unique<char[]>(targetLength);
    std::memset(target.get(), untouched, targetLength);
    Tesk::SimpleIdentityManagementProvider::SimAccountFactory factory;
    factory.convertCodepage(target.get(), targetLength, source.get(), sourceLength);
    require(text == std::string_view(source.get(), text.size()));
    return {target.get(), ::strnlen(target.get(), targetLength)};
}

// Where the code page is UTF-8, proper text stays as it is if there is room for it.
void checkUtf8(std::string_view source, std::size_t targetLength, const std::string& result) {
    const std::string_view read = source.substr(0, std::min<std::size_t>(254, source.find('\0')));
    require(read.size() > targetLength || !qelo::cim::isValidUtf8(read) || result == read);
}

void checkConversion(std::string_view input) {
    if (input.size() < 3) {
        return;
    }
    const std::size_t codepage = static_cast<unsigned char>(input[0]) % codepages.size();
    const auto targetLength = 1U + static_cast<unsigned char>(input[1]);
    const std::string_view text = input.substr(2);
    // Never more than there is, unless a zero comes before.
    const bool ends = qelo::fuzz::contains(text, std::string_view("\0", 1));
    const auto sourceLength = ends ? 4000000000U : static_cast<unsigned int>(text.size());
    ucnv_setDefaultName(codepages[codepage]);
    const std::string result = convert(text, targetLength, sourceLength);
    require(result.size() <= targetLength);
    if (std::strcmp(ucnv_getDefaultName(), "UTF-8") == 0) {
        checkUtf8(text, targetLength, result);
    }
}

void checkWide(std::string_view input) {
    std::wstring wide(input.size() / sizeof(wchar_t), L'\0');
    if (!wide.empty()) {
        std::memcpy(wide.data(), input.data(), wide.size() * sizeof(wchar_t));
    }
    const std::string narrow = Tesk::make_string(wide);
    std::size_t at = 0;
    for (const wchar_t character : wide) {
        const auto read = qelo::cim::decodeUtf8(narrow, at);
        require(read.has_value());
        const auto wanted = static_cast<char32_t>(character);
        const bool isCharacter = wanted < 0xD800 || (wanted > 0xDFFF && wanted <= 0x10FFFF);
        require(read->code == (isCharacter ? wanted : 0xFFFD));
        at += read->length;
    }
    require(at == narrow.size());
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view input = qelo::fuzz::viewOf(data, size);
    checkConversion(input);
    checkWide(input);
    return 0;
}
