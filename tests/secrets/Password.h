// A password that nothing else in the world is like, and every form in which it may show up.
#pragma once

#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace qelo::secrets {

class Password {
public:
    // Letters and digits only: some clients take nothing else.
    static Password plain();
    // With characters that are escaped in XML, in URLs and by shells.
    static Password awkward();

    explicit Password(std::string text);

    const std::string& text() const { return text_; }
    std::string inUrl() const;
    std::string inXml() const;
    // How it is found at all: as it is, percent-encoded, XML-escaped, in UTF-16 and UTF-32, and in
    // base64 at each of its three positions, so that a user's name may stand before it.
    const std::vector<std::pair<std::string, std::string>>& forms() const { return forms_; }

    // The names of the forms that are in a text; empty: none.
    std::string formsIn(std::string_view text) const;

private:
    std::string text_;
    std::vector<std::pair<std::string, std::string>> forms_;
};

} // namespace qelo::secrets
