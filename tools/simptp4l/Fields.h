/// @file
/// Messages as lists of named integers: one list serves encoding, sizing and the script's `set`.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace simptp4l {

using Octets = std::vector<std::uint8_t>;

/// One integer of a message, big-endian on the wire. Octets of a text and padding have no name.
struct Field {
    std::string_view name;
    unsigned width; ///< octets, 1 to 8
    std::uint64_t value;
};

using FieldList = std::vector<Field>;

/// A value that the script forces into a field.
struct Override {
    std::string message; ///< name of a data set, or "HEADER"
    std::string field;
    std::uint64_t value = 0;
    std::optional<unsigned> port; ///< only in answers of this port; empty: in all
};

/// Total width in octets.
std::size_t size(const FieldList& fields);

/// Appends the octets of every field.
void encode(const FieldList& fields, Octets& octets);

/// Sets the first field of that name; does nothing when there is none.
void assign(FieldList& fields, std::string_view name, std::uint64_t value);

/// Applies the overrides meant for `message` in an answer of `port`, in their order.
void apply(const std::vector<Override>& overrides, std::string_view message, unsigned port,
           FieldList& fields);

} // namespace simptp4l
