#include "Properties.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <stdexcept>

namespace qelo::nodes {

namespace {

constexpr std::size_t numberSize = sizeof(std::uint32_t);

std::uint32_t narrowed(std::size_t size) {
    if (size > std::numeric_limits<std::uint32_t>::max()) {
        throw std::length_error("a node holds too much");
    }
    return static_cast<std::uint32_t>(size);
}

} // namespace

void Properties::append(int id, Kind kind, std::size_t begin) {
    entries_.push_back({id, kind, narrowed(begin), narrowed(bytes_.size() - begin)});
}

void Properties::putNumber(std::uint32_t number) {
    bytes_.append(reinterpret_cast<const char*>(&number), numberSize);
}

std::uint32_t Properties::numberAt(std::size_t at) const {
    std::uint32_t number = 0;
    std::memcpy(&number, bytes_.data() + at, numberSize);
    return number;
}

void Properties::add(int id, std::string_view text) {
    const std::size_t begin = bytes_.size();
    bytes_.append(text);
    append(id, Kind::text, begin);
}

void Properties::add(int id, unsigned int number) {
    entries_.push_back({id, Kind::number, number, 0});
}

void Properties::add(int id, const std::vector<unsigned int>& numbers) {
    const std::size_t begin = bytes_.size();
    for (const unsigned int number : numbers) {
        putNumber(number);
    }
    append(id, Kind::numbers, begin);
}

// Each text with its length before it.
void Properties::add(int id, const std::vector<std::string>& texts) {
    const std::size_t begin = bytes_.size();
    for (const std::string& text : texts) {
        putNumber(narrowed(text.size()));
        bytes_.append(text);
    }
    append(id, Kind::texts, begin);
}

void Properties::addEmptyList(int id) { entries_.push_back({id, Kind::emptyList, 0, 0}); }

bool Properties::seal() {
    const auto before = [](const Entry& left, const Entry& right) { return left.id < right.id; };
    const auto same = [](const Entry& left, const Entry& right) { return left.id == right.id; };
    std::sort(entries_.begin(), entries_.end(), before);
    entries_.shrink_to_fit();
    bytes_.shrink_to_fit();
    return std::adjacent_find(entries_.begin(), entries_.end(), same) == entries_.end();
}

const Properties::Entry* Properties::find(int id) const {
    const auto at =
        std::lower_bound(entries_.begin(), entries_.end(), id,
                         [](const Entry& entry, int wanted) { return entry.id < wanted; });
    return at != entries_.end() && at->id == id ? &*at : nullptr;
}

// The entry when it has that kind; a list without kind has the kind of each list.
const Properties::Entry* Properties::find(int id, Kind kind) const {
    const Entry* entry = find(id);
    const bool list = kind == Kind::numbers || kind == Kind::texts;
    const bool fits = entry && (entry->kind == kind || (list && entry->kind == Kind::emptyList));
    return fits ? entry : nullptr;
}

bool Properties::read(int id, std::string& value) const {
    const Entry* entry = find(id, Kind::text);
    if (entry) {
        value.assign(bytes_, entry->begin, entry->size);
    }
    return entry != nullptr;
}

bool Properties::read(int id, unsigned int& value) const {
    const Entry* entry = find(id, Kind::number);
    if (entry) {
        value = entry->begin;
    }
    return entry != nullptr;
}

bool Properties::read(int id, std::vector<unsigned int>& value) const {
    const Entry* entry = find(id, Kind::numbers);
    if (!entry) {
        return false;
    }
    value.clear();
    value.reserve(entry->size / numberSize);
    for (std::size_t at = 0; at < entry->size; at += numberSize) {
        value.push_back(numberAt(entry->begin + at));
    }
    return true;
}

bool Properties::read(int id, std::vector<std::string>& value) const {
    const Entry* entry = find(id, Kind::texts);
    if (!entry) {
        return false;
    }
    value.clear();
    const std::size_t end = std::size_t{entry->begin} + entry->size;
    for (std::size_t at = entry->begin; at < end;) {
        const std::size_t size = numberAt(at);
        value.emplace_back(bytes_, at + numberSize, size);
        at += numberSize + size;
    }
    return true;
}

} // namespace qelo::nodes
