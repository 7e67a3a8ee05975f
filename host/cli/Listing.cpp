#include "Listing.h"

#include "render/Writer.h"

namespace qelo::cli {

std::string cellText(const cim::Instance& instance, const char* property) {
    const cim::Value* value = instance.property(property);
    return value == nullptr || value->isNull() ? "-" : value->toText();
}

std::string counted(std::size_t number, const char* singular, const char* plural) {
    return std::to_string(number) + " " + (number == 1 ? singular : plural);
}

void writeTable(CommandContext& context, const Table& table, const std::string& summary) {
    if (!table.empty()) {
        table.write(context.output());
        context.output().write("\n");
    }
    context.output().write(summary + "\n");
}

void writeInstances(CommandContext& context, const std::string& className) {
    const auto writer = makeWriter(context.options().format, context.output());
    context.connection().enumerateInstances(
        classPathOf(className, context.options()), std::nullopt,
        [&](const cim::Instance& instance) { writer->instance(instance); });
    writer->finish();
}

} // namespace qelo::cli
