/// @file
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>

/// What libFuzzer, or the replay of a corpus, calls for every input.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

/// Ends the process, whatever the build type, when something that always holds does not.
inline void require(bool holds, const char* what) {
    if (!holds) {
        std::fprintf(stderr, "does not hold: %s\n", what);
        std::abort();
    }
}

/// Takes an input apart from its front. An input that is used up gives zeros and empty texts.
class FuzzInput {
public:
    FuzzInput(const std::uint8_t* data, std::size_t size) : data_(data), size_(size) {}

    bool atEnd() const { return size_ == 0; }

    std::uint8_t octet() {
        if (atEnd()) {
            return 0;
        }
        --size_;
        return *data_++;
    }

    std::uint32_t integer() {
        std::uint32_t value = 0;
        for (int index = 0; index < 4; ++index) {
            value = value << 8 | octet();
        }
        return value;
    }

    /// One octet of length, then as many octets of text.
    std::string text() {
        const std::size_t wanted = octet();
        const std::size_t length = wanted < size_ ? wanted : size_;
        std::string text(data_, data_ + length);
        data_ += length;
        size_ -= length;
        return text;
    }

private:
    const std::uint8_t* data_;
    std::size_t size_;
};
