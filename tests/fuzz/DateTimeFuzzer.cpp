// Dates as texts, in the three places that read them: each gives a whole date or none, and
// where two read the same text they mean the same moment.
#include "FuzzInput.h"

#include <CimDay.h>
#include <account/SimAccountObjFactory.h>
#include <cim/DateTime.h>

#include <algorithm>

namespace {

using qelo::cim::DateTime;
using qelo::fuzz::require;

constexpr std::uint64_t microsPerDay = 86400ULL * 1000000ULL;
constexpr std::uint64_t end9999 = 253402300800ULL * 1000000ULL;
// Offsets may lead past the year.
constexpr std::uint64_t longestOffset = 999ULL * 60 * 1000000;

bool isDigit(char c) { return c >= '0' && c <= '9'; }

void checkForm(const std::string& text) {
    require(text.size() == 25 && text[14] == '.');
    require(text[21] == '+' || text[21] == '-' || text[21] == ':');
    require(text.find_first_not_of("0123456789.+-:*") == std::string::npos);
}

// What is written from the number of microseconds is read as the same number again.
void checkWritten(std::uint64_t microseconds, bool interval) {
    const DateTime written = DateTime::fromMicroseconds(microseconds, interval);
    checkForm(written.text());
    require(written.isInterval() == interval && written.microseconds() <= microseconds);
    const auto again = DateTime::parse(written.text());
    require(again && *again == written);
    require(DateTime::fromMicroseconds(again->microseconds(), interval) == written);
    require(written.microseconds() == microseconds ||
            microseconds >= (interval ? 100000000 * microsPerDay : end9999));
}

void checkHost(std::string_view text) {
    const auto date = DateTime::parse(text);
    if (!date) {
        return;
    }
    require(date->text() == text);
    checkForm(date->text());
    require(date->isInterval() ? date->microseconds() < 100000000 * microsPerDay
                               : date->microseconds() < end9999 + longestOffset);
    checkWritten(date->microseconds(), date->isInterval());
}

void checkDay(std::string_view text) {
    const auto day = qelo::store::dayOfDateTime(text);
    if (!day) {
        require(!day.reason().empty());
        return;
    }
    const auto date = DateTime::parse(text);
    require(date && !date->isInterval() && *day >= 0);
    require(static_cast<std::uint64_t>(*day) == date->microseconds() / microsPerDay);
}

void checkAdjusted(std::string_view text) {
    Tesk::SimpleIdentityManagementProvider::SimAccountFactory factory;
    const std::string adjusted = factory.adjustString(std::string(text));
    std::string digits;
    std::copy_if(text.begin(), text.end(), std::back_inserter(digits), isDigit);
    require(adjusted == (digits.size() < 14 ? "" : digits.substr(0, 14) + ".000000+000"));
    // A date of the store is a date for everybody, or for nobody.
    const auto date = DateTime::parse(adjusted);
    const auto day = qelo::store::dayOfDateTime(adjusted);
    require(!day || (date && date->text() == adjusted));
    require(!date || date->microseconds() == 0 || day);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text = qelo::fuzz::viewOf(data, size);
    checkHost(text);
    checkDay(text);
    checkAdjusted(text);
    std::uint64_t number = 0;
    text.substr(0, sizeof number).copy(reinterpret_cast<char*>(&number), sizeof number);
    checkWritten(number, false);
    checkWritten(number, true);
    return 0;
}
