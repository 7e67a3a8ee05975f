// An enumeration of the broker's that fails on the way: what it yielded so far is not passed off
// as all there is.
#include "AssociationFixture.h"

namespace qelo::test {
namespace {

class AssociationBreak : public AssociationFixture {
protected:
    // Has the enumeration fail at its first element, at its second, and where it should end, in
    // `operation`, which asks the broker for two far objects.
    void breakEach(const std::string& name, const std::function<Outcome()>& operation) {
        for (const auto& [slot, n] :
             {std::pair("getNext", 1U), {"getNext", 2U}, {"hasNext", 1U}, {"hasNext", 3U}}) {
            SCOPED_TRACE(name + ", " + slot + " " + std::to_string(n));
            platform_.forget();
            broker_.clearFaults();
            broker_.failSlot(slot, n, broken_);
            expectBroken(operation());
            EXPECT_LT(broker_.returnedPaths().size() + broker_.returnedInstances().size(),
                      n == 3 ? 7U : 6U);
            expectFailedStep(name, enumerationFailed);
        }
    }
};

TEST_P(AssociationBreak, In_an_enumeration) {
    serveTwoAndThree();
    breakEach("EnumInstanceNames", [&] { return enumNames(); });
    breakEach("EnumInstances", [&] {
        const Outcome outcome = enumInstances();
        expectNothingReturned();
        return outcome;
    });
}

TEST_P(AssociationBreak, On_the_way_to_the_far_objects) {
    serveTwoAndThree();
    const CMPIObjectPath* source = nearPath("/a");
    breakEach("Associators", [&] { return associators(source, along()); });
    breakEach("AssociatorNames", [&] { return associatorNames(source, along()); });
    breakEach("References", [&] { return references(source); });
    breakEach("ReferenceNames", [&] { return referenceNames(source); });
}

QELO_FOR_BOTH_ASSOCIATIONS(AssociationBreak);

} // namespace
} // namespace qelo::test
