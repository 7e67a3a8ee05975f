// Methods and single properties of widgets.
#include "Widgets.h"

#include <functional>
#include <stdexcept>
#include <vector>

namespace {

using namespace widgets;

struct Invocation {
    const CMPIContext* ctx;
    const CMPIResult* rslt;
    const CMPIObjectPath* op;
    const CMPIArgs* in;
    CMPIArgs* out;
};

CMPIStatus returnNumber(const CMPIResult* rslt, CMPIUint32 number) {
    CMReturnData(rslt, &number, CMPI_uint32);
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

CMPIStatus returnText(const CMPIResult* rslt, const std::string& text) {
    CMReturnData(rslt, text.c_str(), CMPI_chars);
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

CMPIStatus echo(const Invocation& call) {
    const CMPICount count = CMGetArgCount(call.in, nullptr);
    for (CMPICount i = 0; i < count; ++i) {
        CMPIString* name = nullptr;
        const CMPIData data = CMGetArgAt(call.in, i, &name, nullptr);
        CMAddArg(call.out, CMGetCharPtr(name), CMIsNullValue(data) ? nullptr : &data.value,
                 data.type);
    }
    return returnNumber(call.rslt, count);
}

CMPIStatus whoAmI(const Invocation& call) {
    const auto entry = [&](const char* name) {
        return textOf(CMGetContextEntry(call.ctx, name, nullptr));
    };
    return returnText(call.rslt, entry(CMPIPrincipal) + "/" + entry(CMPIRole) + "/" +
                                     entry(CMPIAcceptLanguage));
}

// Asks for the same through the broker.
CMPIStatus whoAmIByUpCall(const Invocation& call) {
    CMPIStatus st = {};
    const CMPIData data = CBInvokeMethod(broker, call.ctx, call.op, "WhoAmI",
                                         CMNewArgs(broker, nullptr), nullptr, &st);
    return st.rc == CMPI_RC_OK ? returnText(call.rslt, textOf(data)) : st;
}

// Never ends by itself.
CMPIStatus recurse(const Invocation& call) {
    CMPIStatus st = {};
    CBInvokeMethod(broker, call.ctx, call.op, "Recurse", call.in, nullptr, &st);
    return st;
}

CMPIStatus describeAll(const Invocation& call) {
    CMPIStatus st = {};
    std::string text;
    CMPIEnumeration* all = CBEnumInstances(broker, call.ctx, call.op, nullptr, &st);
    while (st.rc == CMPI_RC_OK && CMHasNext(all, nullptr)) {
        const CMPIData data = CMGetNext(all, nullptr);
        text += textOf(CMGetProperty(data.value.inst, "Color", nullptr)) + " ";
    }
    return st.rc == CMPI_RC_OK ? returnText(call.rslt, text) : st;
}

CMPIStatus returnPath(const Invocation& call) {
    CMReturnObjectPath(call.rslt, makePath("", "TEST_Widget", "one"));
    CMReturn(CMPI_RC_OK);
}

CMPIStatus returnInstance(const Invocation& call) {
    CMReturnInstance(call.rslt, makeInstance("", "TEST_Widget", "one", {"red", 1}, nullptr));
    CMReturn(CMPI_RC_OK);
}

// A clone outlives the call; the next call finds and ends it.
CMPIStatus keepClone(const Invocation& call) {
    static CMPIString* kept = nullptr;
    std::string before = "nothing";
    if (kept) {
        before = textOf(kept);
        CMRelease(kept);
        kept = nullptr;
        return returnText(call.rslt, before);
    }
    const CMPIString* text = CMGetArg(call.in, "Text", nullptr).value.string;
    kept = CMClone(text, nullptr);
    return returnText(call.rslt, before);
}

CMPIStatus useMarks(const Invocation& call) {
    CMPIUint32 rounds = 0;
    for (; rounds < 100; ++rounds) {
        CMPIGcStat* mark = broker->mft->mark(broker, nullptr);
        for (int i = 0; i < 100; ++i) {
            makeInstance("root/test", "TEST_Widget", "temporary", {"gray", 3}, nullptr);
        }
        if (broker->mft->release(broker, mark).rc != CMPI_RC_OK) {
            break;
        }
    }
    return returnNumber(call.rslt, rounds);
}

CMPIStatus failWithErrorObject(const Invocation& call) {
    const CMPIError* error =
        CMNewCMPIError(broker, "tests", "T1", "told by the error object", ErrorSevHigh,
                       ErrorProbCauseOther, CMPI_RC_ERR_ACCESS_DENIED, nullptr);
    CMReturnError(call.rslt, error);
    CMReturn(CMPI_RC_ERR_ACCESS_DENIED);
}

const std::map<std::string, std::function<CMPIStatus(const Invocation&)>> methods = {
    {"Echo", echo},
    {"WhoAmI", whoAmI},
    {"WhoAmIByUpCall", whoAmIByUpCall},
    {"Recurse", recurse},
    {"DescribeAll", describeAll},
    {"ReturnPath", returnPath},
    {"ReturnInstance", returnInstance},
    {"ReturnNothing",
     [](const Invocation&) {
         return CMPIStatus{CMPI_RC_OK, nullptr};
     }},
    {"KeepClone", keepClone},
    {"UseMarks", useMarks},
    {"FailWithErrorObject", failWithErrorObject},
    {"EnumerateInThread",
     [](const Invocation& call) { return enumerateInThread(call.ctx, call.rslt, call.op); }},
    {"Throw", [](const Invocation&) -> CMPIStatus { throw std::runtime_error("out of paint"); }},
    {"ThrowNumber", [](const Invocation&) -> CMPIStatus { throw 5; }},
    {"ThrowRange",
     [](const Invocation&) -> CMPIStatus {
         const std::vector<int> none;
         return {static_cast<CMPIrc>(none.at(3)), nullptr};
     }},
    {"OddStatus",
     [](const Invocation&) {
         return CMPIStatus{CMPI_RC_ERROR_SYSTEM, nullptr};
     }},
};

CMPIStatus cleanup(CMPIMethodMI*, const CMPIContext*, CMPIBoolean) {
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus invoke(CMPIMethodMI*, const CMPIContext* ctx, const CMPIResult* rslt,
                  const CMPIObjectPath* op, const char* method, const CMPIArgs* in, CMPIArgs* out) {
    const auto found = methods.find(method);
    if (found == methods.end()) {
        CMReturn(CMPI_RC_ERR_METHOD_NOT_FOUND);
    }
    return found->second({ctx, rslt, op, in, out});
}

const CMPIMethodMIFT methodTable = {CMPIVersion200, 1, "Widget", cleanup, invoke};

std::map<std::string, CMPIUint32> levels;

CMPIStatus propertyCleanup(CMPIPropertyMI*, const CMPIContext*, CMPIBoolean) {
    throw std::runtime_error("cannot clean up");
}

CMPIStatus setLevel(CMPIPropertyMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                    const char* name, const CMPIData data) {
    if (data.type != CMPI_uint32) {
        CMReturn(CMPI_RC_ERR_TYPE_MISMATCH);
    }
    levels[name] = data.value.uint32;
    CMReturn(CMPI_RC_OK);
}

CMPIStatus getLevel(CMPIPropertyMI*, const CMPIContext*, const CMPIResult* rslt,
                    const CMPIObjectPath*, const char* name) {
    const auto found = levels.find(name);
    if (found != levels.end()) {
        CMReturnData(rslt, &found->second, CMPI_uint32);
    }
    CMReturn(CMPI_RC_OK);
}

// One slot shorter than it could be, as some providers' tables are.
const CMPIPropertyMIFT propertyTable = {100,      1,        "Level", propertyCleanup,
                                        setLevel, getLevel, nullptr};

} // namespace

CMPI_EXTERN_C CMPIMethodMI* Widget_Create_MethodMI(const CMPIBroker* mb, const CMPIContext*,
                                                   CMPIStatus*) {
    static CMPIMethodMI mi = {nullptr, &methodTable};
    broker = mb;
    CMLogMessage(mb, CMPI_SEV_INFO, "create", "method interface", nullptr);
    return &mi;
}

CMPI_EXTERN_C CMPIPropertyMI* Level_Create_PropertyMI(const CMPIBroker* mb, const CMPIContext*,
                                                      CMPIStatus*) {
    static CMPIPropertyMI mi = {nullptr, &propertyTable};
    broker = mb;
    return &mi;
}
