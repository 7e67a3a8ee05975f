// Properties of a node by number, each with a value of one of four types, packed: a system
// may have very many accounts, so a node costs few allocations and no byte twice.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace qelo::nodes {

class Properties {
public:
    // Adds a property. All values of one object together may take up to 4 GiB.
    void add(int id, std::string_view text);
    void add(int id, unsigned int number);
    void add(int id, const std::vector<unsigned int>& numbers);
    void add(int id, const std::vector<std::string>& texts);

    // A list without elements whose kind is not known: it reads as a list of either kind.
    void addEmptyList(int id);

    // Puts the properties in order; to be called after the last one was added. False when a
    // number was added more than once.
    bool seal();

    bool has(int id) const { return find(id) != nullptr; }

    // Copies a value of the wanted type; otherwise false, and `value` stays as it was.
    bool read(int id, std::string& value) const;
    bool read(int id, unsigned int& value) const;
    bool read(int id, std::vector<unsigned int>& value) const;
    bool read(int id, std::vector<std::string>& value) const;

private:
    enum class Kind : std::uint8_t { text, number, numbers, texts, emptyList };
    struct Entry {
        int id;
        Kind kind;
        std::uint32_t begin; // of the value in bytes_, or the number itself
        std::uint32_t size;
    };

    const Entry* find(int id) const;
    const Entry* find(int id, Kind kind) const;
    void append(int id, Kind kind, std::size_t begin);
    std::uint32_t numberAt(std::size_t at) const;
    void putNumber(std::uint32_t number);

    std::vector<Entry> entries_;
    std::string bytes_;
};

} // namespace qelo::nodes
