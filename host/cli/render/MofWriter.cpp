#include "Mof.h"
#include "Writer.h"

namespace qelo::cli {
namespace {

class MofWriter final : public Writer {
public:
    explicit MofWriter(Output& output) : output_(output) {}

    // MOF knows no bare paths; a path is the instance that has its keys only.
    void path(const cim::ObjectPath& path) override {
        cim::Instance keys(path);
        for (const auto& key : path.keys()) {
            keys.setProperty(key.name, key.value);
        }
        instance(keys);
    }

    void instance(const cim::Instance& instance) override {
        output_.write(separator_ + mofInstance(instance));
        separator_ = "\n";
    }

    void finish() override {}

private:
    Output& output_;
    std::string separator_;
};

} // namespace

std::unique_ptr<Writer> makeMofWriter(Output& output) {
    return std::make_unique<MofWriter>(output);
}

} // namespace qelo::cli
