// For people: a path on its line, an instance as its path and a block of properties below.
#include "Display.h"
#include "Mof.h"
#include "Writer.h"

#include <algorithm>

namespace qelo::cli {
namespace {

// As in MOF, but a datetime needs no quotes here, nor does a reference inside its own line.
std::string valueText(const cim::Value& value) {
    const bool bare = !value.isNull() && !value.isArray() && value.type() == cim::Type::DateTime;
    return bare ? value.toText() : mofValue(value);
}

std::string propertyLine(const std::string& name, std::size_t width, const cim::Value& value) {
    std::string text = "  " + displayText(name);
    text.append(width - std::min(width, displayWidth(text)), ' ');
    return text + " = " + valueText(value) + "\n";
}

class TextWriter final : public Writer {
public:
    explicit TextWriter(Output& output) : output_(output) {}

    void path(const cim::ObjectPath& path) override {
        output_.write(displayText(path.toText()) + "\n");
    }

    void instance(const cim::Instance& instance) override {
        std::size_t width = 0;
        for (const auto& property : instance.properties()) {
            width = std::max(width, displayWidth(displayText(property.name)) + 2);
        }
        std::string text = separator_ + displayText(instance.path().toText()) + "\n";
        for (const auto& property : instance.properties()) {
            text += propertyLine(property.name, width, property.value);
        }
        output_.write(text);
        separator_ = "\n";
    }

    void finish() override {}

private:
    Output& output_;
    std::string separator_;
};

} // namespace

std::unique_ptr<Writer> makeTextWriter(Output& output) {
    return std::make_unique<TextWriter>(output);
}

std::string methodResultText(const client::MethodResult& result) {
    std::size_t width = displayWidth("  ReturnValue");
    for (const auto& [name, value] : result.out) {
        width = std::max(width, displayWidth(displayText(name)) + 2);
    }
    std::string text = propertyLine("ReturnValue", width, result.returnValue);
    for (const auto& [name, value] : result.out) {
        text += propertyLine(name, width, value);
    }
    return text;
}

} // namespace qelo::cli
