#include "RZLog/RZMessageBuffer.h"

#include <atomic>
#include <locale>
#include <streambuf>

namespace RZLog {

namespace {

/** Appends the output of a stream to a string. */
class StringAppender : public std::streambuf {
public:
    std::string text;

protected:
    std::streamsize xsputn(const char* characters, std::streamsize count) override {
        text.append(characters, static_cast<std::size_t>(count));
        return count;
    }

    int_type overflow(int_type character) override {
        if (!traits_type::eq_int_type(character, traits_type::eof())) {
            text.push_back(traits_type::to_char_type(character));
        }
        return traits_type::not_eof(character);
    }
};

/**
 * Unused elements for later use. Uses atomic pointers instead of a lock. Does not use thread-local data, since their
 * destructors would keep the library from being unloaded.
 */
template <typename Element, std::size_t Size>
class Pool {
public:
    ~Pool() {
        for (std::atomic<Element*>& place : places) {
            delete place.exchange(nullptr);
        }
    }

    /** Removes an element. @return null if the pool is empty */
    std::unique_ptr<Element> take() {
        for (std::atomic<Element*>& place : places) {
            if (place.load(std::memory_order_relaxed) != nullptr) {
                if (Element* element = place.exchange(nullptr, std::memory_order_acquire)) {
                    return std::unique_ptr<Element>(element);
                }
            }
        }
        return nullptr;
    }

    /** Stores an element, or destroys it if there is no room. */
    void give(std::unique_ptr<Element> element) {
        for (std::atomic<Element*>& place : places) {
            Element* none = nullptr;
            if (place.compare_exchange_strong(none, element.get(), std::memory_order_release,
                                              std::memory_order_relaxed)) {
                static_cast<void>(element.release());
                return;
            }
        }
    }

private:
    std::atomic<Element*> places[Size] = {};
};

}  // namespace

/** Pooled, because constructing a stream for each trace line is expensive. */
struct RZMessageBuffer::Implementation {
    StringAppender appender;
    std::ostream stream{&appender};

    static Pool<Implementation, 16> pool;

    Implementation() { stream.imbue(std::locale::classic()); }

    /** Resets the stream to the state of a new one. */
    void resetStream() {
        stream.exceptions(std::ios_base::goodbit);
        stream.rdbuf(&appender);  // clears the error state too
        stream.flags(std::ios_base::dec | std::ios_base::skipws);
        stream.width(0);
        stream.precision(6);
        stream.fill(' ');
        stream.tie(nullptr);
        if (stream.getloc() != std::locale::classic()) {
            stream.imbue(std::locale::classic());
        }
    }

    void empty() {
        constexpr std::size_t mostKept = 65536;
        if (appender.text.capacity() > mostKept) {
            appender.text = std::string();
        }
        appender.text.clear();
        resetStream();
    }

    std::string take() {
        std::string text = appender.text;
        empty();
        return text;
    }
};

Pool<RZMessageBuffer::Implementation, 16> RZMessageBuffer::Implementation::pool;

RZMessageBuffer::RZMessageBuffer() : implementation(Implementation::pool.take()) {
    if (implementation == nullptr) {
        implementation = std::make_unique<Implementation>();
    }
}

RZMessageBuffer::~RZMessageBuffer() {
    implementation->empty();
    Implementation::pool.give(std::move(implementation));
}

std::ostream& RZMessageBuffer::operator<<(const char* text) {
    if (text != nullptr) {
        implementation->appender.text.append(text);
    }
    return implementation->stream;
}

RZMessageBuffer::operator std::ostream&() {
    return implementation->stream;
}

std::string RZMessageBuffer::str(RZMessageBuffer& buffer) {
    return buffer.implementation->take();
}

std::string RZMessageBuffer::str(std::ostream& /*stream*/) {
    return implementation->take();
}

}  // namespace RZLog
