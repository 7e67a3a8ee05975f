// Makes one allocation of this thread fail. A program that includes this header must link
// FailingNew.cpp, which replaces the global operator new.
#pragma once

namespace qelo::test {

class FailingNew {
public:
    // The `position`-th call of operator new from now on, counted from 1, throws bad_alloc.
    explicit FailingNew(int position);
    ~FailingNew();
    FailingNew(const FailingNew&) = delete;
    FailingNew& operator=(const FailingNew&) = delete;

    // Whether that call was made.
    bool hasFailed() const;
};

} // namespace qelo::test
