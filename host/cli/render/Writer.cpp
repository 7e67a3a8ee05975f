#include "Writer.h"

namespace qelo::cli {

std::unique_ptr<Writer> makeWriter(Format format, Output& output) {
    switch (format) {
    case Format::Json:
        return makeJsonWriter(output);
    case Format::Mof:
        return makeMofWriter(output);
    case Format::Text:
        break;
    }
    return makeTextWriter(output);
}

void writeMethodResult(Format format, const client::MethodResult& result, Output& output) {
    output.write(format == Format::Json ? methodResultJson(result) : methodResultText(result));
}

} // namespace qelo::cli
