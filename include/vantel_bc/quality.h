/// @file
/// The quality records that the plug-in passes to `zekel_setTRQuality`.
#ifndef VANTEL_BC_QUALITY_H
#define VANTEL_BC_QUALITY_H

/// Number of doubles in a quality record.
#define ZEKEL_QUALITY_LENGTH 3

/// Initialiser of the record sent while ptp4l reports a grandmaster.
/// Bit patterns 0x3E5AD7F29ABCAF48, 0x3EB0C6F7A0B5ED8D, 0xBFF0000000000000.
#define ZEKEL_QUALITY_USABLE                                                                       \
    { 2.5e-08, 1e-06, -1.0 }

/// Initialiser of the record sent in every other case.
/// Bit patterns 0xC000000000000000 twice, 0xBFF0000000000000.
#define ZEKEL_QUALITY_UNUSABLE                                                                     \
    { -2.0, -2.0, -1.0 }

#endif
