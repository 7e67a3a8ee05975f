#include "RegistrationFile.h"

#include <cim/ObjectPath.h>

#include <algorithm>
#include <optional>

namespace qelo::broker {
namespace {

constexpr std::string_view kBlanks = " \t\r\f\v";
constexpr std::size_t kMostSections = 65536;

std::string_view trimmed(std::string_view text) {
    const std::size_t first = text.find_first_not_of(kBlanks);
    if (first == std::string_view::npos) {
        return {};
    }
    return text.substr(first, text.find_last_not_of(kBlanks) + 1 - first);
}

std::vector<std::string> words(std::string_view text) {
    std::vector<std::string> list;
    for (text = trimmed(text); !text.empty(); text = trimmed(text)) {
        const std::string_view word = text.substr(0, text.find_first_of(kBlanks));
        list.emplace_back(word);
        text.remove_prefix(word.size());
    }
    return list;
}

std::optional<ProviderType> typeOf(std::string_view word) {
    const auto found =
        std::find_if(allProviderTypes.begin(), allProviderTypes.end(), [&](ProviderType type) {
            return cim::sameName(providerTypeName(type), word);
        });
    return found == allProviderTypes.end() ? std::nullopt : std::make_optional(*found);
}

bool isName(std::string_view text) {
    return !text.empty() && (text.front() < '0' || text.front() > '9') &&
           std::all_of(text.begin(), text.end(), [](char c) {
               return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || (c >= '0' && c <= '9') ||
                      c == '_';
           });
}

// Texts reach a function name, a file name and messages.
bool isPlain(std::string_view text) {
    return std::all_of(text.begin(), text.end(),
                       [](unsigned char c) { return c > 0x20 && c != 0x7f; });
}

class Reader {
public:
    explicit Reader(const std::string& name) : name_(name) {}

    RegistrationFile read(std::string_view text) {
        while (!text.empty()) {
            ++line_;
            const std::size_t end = std::min(text.find('\n'), text.size());
            const std::string_view line = trimmed(text.substr(0, end));
            text.remove_prefix(std::min(end + 1, text.size()));
            if (!line.empty() && line.front() != '#') {
                readLine(line);
            }
        }
        finishSection();
        return std::move(file_);
    }

private:
    std::string place(std::size_t line) const { return name_ + ":" + std::to_string(line) + ": "; }

    [[noreturn]] void fail(const std::string& text) const {
        throw schema::SchemaError(place(line_) + text);
    }

    void readLine(std::string_view line) {
        if (line.front() == '[') {
            finishSection();
            startSection(line);
            return;
        }
        const std::size_t colon = line.find(':');
        if (colon == std::string_view::npos) {
            fail("\"[Class]\" or \"key: value\" is expected");
        }
        if (section_ == 0) {
            fail("\"[Class]\" is expected first");
        }
        readEntry(trimmed(line.substr(0, colon)), trimmed(line.substr(colon + 1)));
    }

    void startSection(std::string_view line) {
        const std::string_view className =
            line.back() == ']' ? trimmed(line.substr(1, line.size() - 2)) : std::string_view();
        if (!isName(className)) {
            fail("the name of a class in brackets is expected");
        }
        if (file_.registrations.size() == kMostSections) {
            fail("too many classes");
        }
        section_ = line_;
        current_ = ProviderRegistration();
        current_.className = className;
    }

    void setOnce(std::string& field, std::string_view value, const char* key) {
        if (!field.empty()) {
            fail(std::string(key) + " is given twice");
        }
        if (value.empty() || !isPlain(value)) {
            fail(std::string("a single word is expected for ") + key);
        }
        field = value;
    }

    void readEntry(std::string_view key, std::string_view value) {
        if (cim::sameName(key, "provider")) {
            setOnce(current_.provider, value, "provider");
        } else if (cim::sameName(key, "location")) {
            setOnce(current_.library, value, "location");
        } else if (cim::sameName(key, "type")) {
            readTypes(value);
        } else if (cim::sameName(key, "namespace")) {
            for (std::string& nameSpace : words(value)) {
                current_.nameSpaces.push_back(std::move(nameSpace));
            }
        } else {
            file_.warnings.push_back(place(line_) + "ignored: " + std::string(key));
        }
    }

    void readTypes(std::string_view value) {
        for (const std::string& word : words(value)) {
            const auto type = typeOf(word);
            if (!type) {
                fail("no such type of provider: " + word);
            }
            current_.types.add(*type);
        }
    }

    void finishSection() {
        if (section_ == 0) {
            return;
        }
        const char* missing = current_.provider.empty()     ? "provider"
                              : current_.library.empty()    ? "location"
                              : current_.types.empty()      ? "type"
                              : current_.nameSpaces.empty() ? "namespace"
                                                            : nullptr;
        if (missing != nullptr) {
            throw schema::SchemaError(place(section_) + "class " + current_.className + " has no " +
                                      missing);
        }
        file_.registrations.push_back(std::move(current_));
        section_ = 0;
    }

    const std::string& name_;
    std::size_t line_ = 0;
    std::size_t section_ = 0; // the line where it began; 0: none
    ProviderRegistration current_;
    RegistrationFile file_;
};

} // namespace

RegistrationFile parseRegistrations(const std::string& name, std::string_view text) {
    return Reader(name).read(text);
}

} // namespace qelo::broker
