#include "AnswerText.h"

#include <algorithm>
#include <iterator>

namespace qelo::test {

namespace {

constexpr const char* kOfTheFault = "its status";

std::string codeText(CMPIrc rc) {
    switch (rc) {
    case CMPI_RC_OK:
        return "OK";
    case CMPI_RC_ERR_FAILED:
        return "FAILED";
    case CMPI_RC_ERR_NOT_FOUND:
        return "NOT_FOUND";
    case CMPI_RC_ERR_NOT_SUPPORTED:
        return "NOT_SUPPORTED";
    default:
        return "status " + std::to_string(rc);
    }
}

std::string statusText(const Outcome& outcome) {
    return codeText(outcome.rc) + (outcome.hasMessage ? " \"" + outcome.message + "\"" : "");
}

std::string doneText(const SweptRun& run) { return run.done != 0 ? ", done" : ", not done"; }

std::string resultsText(const SweptRun& run, const SweptRun& good) {
    if (run.delivered == good.delivered) {
        return ", all";
    }
    if (run.delivered.empty()) {
        return ", none";
    }
    const std::multiset<std::string> wanted(good.delivered.begin(), good.delivered.end());
    const std::multiset<std::string> got(run.delivered.begin(), run.delivered.end());
    std::multiset<std::string> same;
    std::set_intersection(wanted.begin(), wanted.end(), got.begin(), got.end(),
                          std::inserter(same, same.end()));
    const std::size_t altered = got.size() - same.size();
    const std::string counts = std::to_string(got.size()) +
                               (got.size() > wanted.size() ? " instead of " : " of ") +
                               std::to_string(wanted.size());
    if (altered != 0) {
        return ", " + counts + ", " + std::to_string(altered) + " altered";
    }
    return ", " + counts + (same.size() == wanted.size() ? ", in another order" : "");
}

// A fault without a status leaves OK.
bool isOfTheFault(const Outcome& outcome, const Fault& fault) {
    const CMPIrc rc = fault.kind == Fault::Kind::Error ? fault.rc : CMPI_RC_OK;
    return outcome.rc == rc && outcome.message == fault.message;
}

} // namespace

std::string answerText(const SweptRun& run) { return statusText(run.outcome) + doneText(run); }

std::string goodText(const SweptRun& run, std::size_t calls, bool exactly) {
    const std::size_t results = run.delivered.size();
    const std::string counted = calls == 0 ? "no" : exactly ? std::to_string(calls) : "some";
    return answerText(run) + ", " + std::to_string(results) +
           (results == 1 ? " result, " : " results, ") + counted + " calls";
}

std::string faultyText(const SweptRun& run, const SweptRun& good) {
    return answerText(run) + resultsText(run, good);
}

std::set<std::string> faultyTexts(const SweptRun& run, const SweptRun& good, const Fault& fault) {
    std::set<std::string> texts = {faultyText(run, good)};
    if (isOfTheFault(run.outcome, fault)) {
        texts.insert(kOfTheFault + doneText(run) + resultsText(run, good));
    }
    return texts;
}

} // namespace qelo::test
