// How results are written: one writer for each output format, all fed in the same way.
// Every item is written when it arrives; nothing is collected, so that any number of
// instances passes through.
//
// A writer that is not finished leaves what it wrote unfinished too: after an error halfway,
// JSON lacks its closing bracket, and nobody can mistake the part for the whole.
#pragma once

#include "../Options.h"
#include "../Output.h"

#include <client/Connection.h>

#include <memory>

namespace qelo::cli {

class Writer {
public:
    virtual ~Writer() = default;

    virtual void path(const cim::ObjectPath& path) = 0;
    virtual void instance(const cim::Instance& instance) = 0;
    virtual void finish() = 0; // once, behind the last item
};

// The output must outlive the writer.
std::unique_ptr<Writer> makeWriter(Format format, Output& output);

std::unique_ptr<Writer> makeTextWriter(Output& output);
std::unique_ptr<Writer> makeJsonWriter(Output& output);
std::unique_ptr<Writer> makeMofWriter(Output& output);

// What a method returned. It has no MOF form; ask for the others only.
void writeMethodResult(Format format, const client::MethodResult& result, Output& output);
std::string methodResultText(const client::MethodResult& result);
std::string methodResultJson(const client::MethodResult& result);

} // namespace qelo::cli
