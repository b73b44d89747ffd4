/// @file
#pragma once

#include <cstddef>

#include "errors/zesdbg_VarLine.h"

/// A line in a buffer of its own.
class zesdbg_VarLineToBuffer : public zesdbg_VarLine {
public:
    static constexpr std::size_t capacity = 512;

    zesdbg_VarLineToBuffer() : zesdbg_VarLine(buffer_, capacity) {}
    zesdbg_VarLineToBuffer(const zesdbg_VarLineToBuffer&) = delete;
    zesdbg_VarLineToBuffer& operator=(const zesdbg_VarLineToBuffer&) = delete;

private:
    char buffer_[capacity] = {};
};
