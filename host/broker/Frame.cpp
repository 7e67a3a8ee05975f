#include "Frame.h"

#include <new>

namespace qelo::broker {
namespace {

// Plain data, so that it can still be read while the thread's other variables end.
thread_local Frame* current = nullptr;
thread_local bool threadEnds = false;

// Closes what a thread leaves open, its own frame included.
struct ThreadEnd {
    ~ThreadEnd() {
        threadEnds = true;
        while (current && current->kind() != Frame::Kind::Call) {
            delete current;
        }
    }
    void touch() {}
};
thread_local ThreadEnd threadEnd;

} // namespace

Frame::Frame(Kind kind) : kind_(kind), below_(current) {
    levels_.push_back(std::make_unique<Arena>());
    current = this;
}

Frame::~Frame() {
    // Only attachments can be above: a call's frame is gone before its caller goes on.
    while (current != this && current) {
        delete current;
    }
    current = below_;
}

const Arena* Frame::mark() {
    levels_.reserve(levels_.size() + 1);
    levels_.push_back(spare_ ? std::move(spare_) : std::make_unique<Arena>(levels_.front().get()));
    return levels_.back().get();
}

Frame::ReleaseResult Frame::release(const void* level) {
    for (std::size_t i = levels_.size(); i > 1; --i) {
        if (levels_[i - 1].get() != level) {
            continue;
        }
        if (i != levels_.size()) {
            return ReleaseResult::NotInnermost;
        }
        spare_ = std::move(levels_.back());
        levels_.pop_back();
        spare_->clear();
        return ReleaseResult::Released;
    }
    return ReleaseResult::Unknown;
}

Frame& currentFrame() {
    if (current) {
        return *current;
    }
    if (threadEnds) {
        throw std::bad_alloc();
    }
    threadEnd.touch();
    new Frame(Frame::Kind::Thread); // becomes current; ThreadEnd deletes it
    return *current;
}

Frame* openFrame() { return current; }

int callDepth() {
    int depth = 0;
    for (const Frame* frame = current; frame; frame = frame->below()) {
        depth += frame->kind() == Frame::Kind::Call ? 1 : 0;
    }
    return depth;
}

void attachFrame() {
    if (threadEnds) {
        throw std::bad_alloc();
    }
    threadEnd.touch();
    new Frame(Frame::Kind::Attachment); // becomes current; detachFrame() deletes it
}

bool detachFrame() {
    if (!current || current->kind() != Frame::Kind::Attachment) {
        return false;
    }
    delete current;
    return true;
}

} // namespace qelo::broker
