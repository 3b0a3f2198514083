#pragma once

#include <cstdint>

#include "mkipod/record_builder.h"

namespace kestrune::mkipod {

// A mono 8-bit PCM WAV file at 11025 Hz holding a soft sine tone of the given length.
Bytes ToneWav(double frequencyHz, std::uint32_t lengthMs);

// `size` bytes of a fixed pattern that depends on `seed`.
Bytes FillerBytes(std::uint32_t size, std::uint32_t seed);

}  // namespace kestrune::mkipod
