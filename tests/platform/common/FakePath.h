// Object paths with any keys, whose function tables can be made to fail at any call.
#pragma once

#include <cmpidt.h>
#include <cmpift.h>

#include <deque>
#include <memory>
#include <string>
#include <vector>

namespace qelo::test {

// What the call that is to fail does instead of its work.
enum class Fault { NullResult, DeadHandle, FailureStatus, MissingSlot };

// The fault to come, for all objects of this file. Not for several threads.
class Faults {
public:
    static void none() { arm(Fault::NullResult, 0); }

    // The `call`-th call from now on, counted from 1, fails; 0 fails none. Counts anew.
    static void arm(Fault fault, int call);

    static int calls() { return calls_; }

    // Called once by every slot.
    static bool strikes();
    static Fault kind() { return fault_; }

private:
    static Fault fault_;
    static int failing_;
    static int calls_;
};

class FakeString {
public:
    explicit FakeString(std::string text);
    FakeString(const FakeString&) = delete;
    FakeString& operator=(const FakeString&) = delete;

    CMPIString* get() { return &object_; }

private:
    friend struct Slots;
    std::string text_;
    CMPIString object_;
};

class FakeDateTime {
public:
    explicit FakeDateTime(const std::string& text);
    FakeDateTime(const FakeDateTime&) = delete;
    FakeDateTime& operator=(const FakeDateTime&) = delete;

    CMPIDateTime* get() { return &object_; }

private:
    friend struct Slots;
    FakeString text_;
    CMPIDateTime object_;
};

class FakePath {
public:
    explicit FakePath(const std::string& className);
    FakePath(const FakePath&) = delete;
    FakePath& operator=(const FakePath&) = delete;

    FakePath& add(const std::string& name, CMPIType type, CMPIValue value,
                  CMPIValueState state = CMPI_keyValue);
    FakePath& addText(const std::string& name, const std::string& text);
    FakePath& addDate(const std::string& name, const std::string& text);
    FakePath& addReference(const std::string& name, const FakePath& path);

    const CMPIObjectPath* get() const { return &object_; }

    // The object itself, for what a broken object manager could hand out.
    CMPIObjectPath& object() { return object_; }

private:
    friend struct Slots;
    struct KeyOfPath {
        FakeString name;
        std::string plainName;
        CMPIData data;
        KeyOfPath(const std::string& text, const CMPIData& value)
            : name(text), plainName(text), data(value) {}
    };

    FakeString className_;
    std::deque<KeyOfPath> keys_;
    std::deque<FakeString> texts_;
    std::deque<FakeDateTime> dates_;
    CMPIObjectPath object_;
};

} // namespace qelo::test
