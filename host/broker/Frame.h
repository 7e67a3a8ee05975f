// Who owns the objects that a thread makes: every call into a provider, and every thread
// that a provider attaches, opens a frame; the objects made meanwhile end with it. Inside a
// frame, marks open nested levels.
//
// A thread that is in no frame, such as a provider's own thread that never attached, has one
// that lasts as long as the thread.
#pragma once

#include "Arena.h"

#include <memory>
#include <vector>

namespace qelo::broker {

class Frame {
public:
    enum class Kind { Call, Attachment, Thread };

    // Becomes the calling thread's current frame.
    explicit Frame(Kind kind);

    // Ends the frame and all that were opened after it and never closed. Runs in the thread
    // that opened it.
    ~Frame();
    Frame(const Frame&) = delete;
    Frame& operator=(const Frame&) = delete;

    Kind kind() const { return kind_; }
    Frame* below() const { return below_; }

    // Where new objects go.
    Arena& arena() { return *levels_.back(); }

    // Opens a level; the pointer identifies it.
    const Arena* mark();

    enum class ReleaseResult { Released, NotInnermost, Unknown };
    ReleaseResult release(const void* level);

private:
    Kind kind_;
    Frame* below_;
    std::vector<std::unique_ptr<Arena>> levels_; // never empty
    std::unique_ptr<Arena> spare_;               // a released level, for the next one
};

// The current frame of this thread. Throws std::bad_alloc when the thread is ending.
Frame& currentFrame();
inline Arena& currentArena() { return currentFrame().arena(); }

// The current frame if one is open, null where only the thread's own could be had.
Frame* openFrame();

// How many calls into providers this thread is in.
int callDepth();

// Attaches and detaches the calling thread. detachFrame() answers false when the innermost
// frame is not an attachment.
void attachFrame();
bool detachFrame();

} // namespace qelo::broker
