#include "mkipod/media_files.h"

#include <algorithm>
#include <cmath>
#include <numbers>

#include "base/bytes.h"

namespace kestrune::mkipod {
namespace {

constexpr std::uint32_t kSampleRate = 11025;

void AppendTag(Bytes& out, const char* tag) {
  for (int i = 0; i < 4; ++i) out.push_back(static_cast<unsigned char>(tag[i]));
}

void AppendU32(Bytes& out, std::uint32_t value) {
  out.resize(out.size() + 4);
  StoreU32Le(out.data() + out.size() - 4, value);
}

void AppendU16(Bytes& out, std::uint16_t value) {
  out.resize(out.size() + 2);
  StoreU16Le(out.data() + out.size() - 2, value);
}

}  // namespace

Bytes ToneWav(double frequencyHz, std::uint32_t lengthMs) {
  const auto samples = static_cast<std::uint32_t>(std::uint64_t{kSampleRate} * lengthMs / 1000);
  const std::uint32_t padding = samples % 2;  // chunks are padded to an even length
  Bytes wav;
  AppendTag(wav, "RIFF");
  AppendU32(wav, 36 + samples + padding);
  AppendTag(wav, "WAVE");
  AppendTag(wav, "fmt ");
  AppendU32(wav, 16);
  AppendU16(wav, 1);  // PCM
  AppendU16(wav, 1);  // mono
  AppendU32(wav, kSampleRate);
  AppendU32(wav, kSampleRate);  // bytes per second
  AppendU16(wav, 1);            // block align
  AppendU16(wav, 8);            // bits per sample
  AppendTag(wav, "data");
  AppendU32(wav, samples);
  const double fade = kSampleRate * 0.05;
  for (std::uint32_t i = 0; i < samples; ++i) {
    const double t = static_cast<double>(i) / kSampleRate;
    const double envelope = std::min({1.0, i / fade, (samples - i) / fade});
    const double value = 0.6 * std::sin(2 * std::numbers::pi * frequencyHz * t) +
                         0.2 * std::sin(2 * std::numbers::pi * frequencyHz * 1.5 * t);
    wav.push_back(static_cast<unsigned char>(std::lround(128 + 100 * envelope * value)));
  }
  if (padding != 0) wav.push_back(0);
  return wav;
}

Bytes FillerBytes(std::uint32_t size, std::uint32_t seed) {
  Bytes bytes(size);
  std::uint32_t state = seed * 2654435761u + 1;
  for (unsigned char& byte : bytes) {
    state ^= state << 13;
    state ^= state >> 17;
    state ^= state << 5;
    byte = static_cast<unsigned char>(state);
  }
  return bytes;
}

}  // namespace kestrune::mkipod
