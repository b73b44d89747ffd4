/// @file
#pragma once

#include <cstddef>
#include <cstring>

/// The slot of a virtual function in its class's table, destructors included: the first two slots
/// are the destructor's. Read from the function pointer as the C++ ABI lays it out (the offset in
/// the table plus 1; on ARM the offset itself).
template <typename Member>
std::size_t slotOf(Member member) {
    std::ptrdiff_t words[2];
    static_assert(sizeof(member) == sizeof(words));
    std::memcpy(words, &member, sizeof(words));
    const auto offset = static_cast<std::size_t>(words[0]) & ~std::size_t{1};
    return offset / sizeof(void*);
}
