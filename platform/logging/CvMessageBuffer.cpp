#include "platform/CvLogger.h"

#include "logging/TextStream.h"

#include <array>
#include <charconv>
#include <limits>
#include <memory>
#include <sstream>
#include <string_view>
#include <utility>

namespace CvLog {

using qelo::logging::appendTo;
using qelo::logging::TextBuffer;
using qelo::logging::TextStream;
using qelo::logging::toString;

// Not part of the interface, though a member of a class that is.
struct __attribute__((visibility("hidden"))) CvMessageBuffer::Text {
    TextBuffer characters;
    std::unique_ptr<TextStream> stream; // made when first asked for
    Text* next = nullptr;               // in the list of unused texts

    void append(std::string_view text) { appendTo(characters, text.data(), text.size()); }

    // A trace point makes and drops one or two buffers, and there are some in every function:
    // each thread keeps a few texts, with their memory, for its next buffers.
    static Text* take();
    static void giveBack(Text* text) noexcept;

private:
    static constexpr unsigned kMostUnused = 4;
    static constexpr std::size_t kLargestKept = 4096;

    // Plain values, so that the list can be used at any time in the life of its thread, also
    // before the reaper's life and after it.
    struct List {
        Text* first;
        unsigned room; // how many more texts may be kept; 0 before and after the reaper
        bool ended;
    };

    // Ends the list when the thread's other thread_local objects are destroyed. Buffers made
    // later than that are allocated one by one.
    struct Reaper {
        ~Reaper();
        void begin() { list.room = kMostUnused; }
    };

    static void keepOrDelete(Text* text) noexcept;

    // Not of the initial-exec model: object managers load this library late, when there is no
    // static thread storage left for it.
    static thread_local List list;
    static thread_local Reaper reaper;
};

thread_local CvMessageBuffer::Text::List CvMessageBuffer::Text::list{nullptr, 0, false};
thread_local CvMessageBuffer::Text::Reaper CvMessageBuffer::Text::reaper;

CvMessageBuffer::Text::Reaper::~Reaper() {
    list.ended = true;
    list.room = 0;
    while (list.first != nullptr) {
        delete std::exchange(list.first, list.first->next);
    }
}

inline CvMessageBuffer::Text* CvMessageBuffer::Text::take() {
    List& unused = list;
    Text* text = unused.first;
    if (text == nullptr) {
        return new Text;
    }
    unused.first = text->next;
    ++unused.room;
    return text;
}

inline void CvMessageBuffer::Text::giveBack(Text* text) noexcept {
    List& unused = list;
    if (unused.room == 0 || text->stream != nullptr || text->characters.capacity() > kLargestKept) {
        keepOrDelete(text);
        return;
    }
    text->characters.clear();
    text->next = unused.first;
    unused.first = text;
    --unused.room;
}

// The rarer cases, apart from the usual one so that this stays short.
[[gnu::noinline]] void CvMessageBuffer::Text::keepOrDelete(Text* text) noexcept {
    if (list.room == 0 && list.first == nullptr && !list.ended) {
        reaper.begin();
    }
    if (list.room == 0 || text->characters.capacity() > kLargestKept) {
        delete text;
        return;
    }
    // A stream keeps what its users set in it, which must not reach its next user.
    text->stream.reset();
    giveBack(text);
}

CvMessageBuffer::CvMessageBuffer() : text_(Text::take()) {}

CvMessageBuffer::~CvMessageBuffer() { Text::giveBack(text_); }

CvMessageBuffer& CvMessageBuffer::operator<<(const char* text) {
    if (text != nullptr) {
        text_->append(text);
    }
    return *this;
}

CvMessageBuffer& CvMessageBuffer::operator<<(const std::string& text) {
    text_->append(text);
    return *this;
}

CvMessageBuffer& CvMessageBuffer::operator<<(unsigned int number) {
    std::array<char, std::numeric_limits<unsigned int>::digits10 + 1> digits{};
    const auto result = std::to_chars(digits.data(), digits.data() + digits.size(), number);
    text_->append({digits.data(), static_cast<std::size_t>(result.ptr - digits.data())});
    return *this;
}

CvMessageBuffer& CvMessageBuffer::operator<<(bool flag) {
    text_->characters.push_back(flag ? '1' : '0');
    return *this;
}

CvMessageBuffer::operator std::ostream&() {
    if (text_->stream == nullptr) {
        text_->stream = std::make_unique<TextStream>(text_->characters);
    }
    return *text_->stream;
}

std::string CvMessageBuffer::str(CvMessageBuffer& buffer) {
    return toString(buffer.text_->characters);
}

// A stream of a kind whose text cannot be read is taken for this buffer's own.
std::string CvMessageBuffer::str(std::ostream& stream) {
    if (const auto* buffered = dynamic_cast<const TextStream*>(&stream)) {
        return toString(buffered->text());
    }
    if (const auto* text = dynamic_cast<const std::ostringstream*>(&stream)) {
        return text->str();
    }
    return toString(text_->characters);
}

} // namespace CvLog
