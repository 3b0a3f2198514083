#include "ui/package/blowfish.h"

#include "base/bytes.h"
#include "ui/package/blowfish_tables.h"

namespace kestrune::ui {

struct BlowfishCipher::State {
  std::array<std::uint32_t, 18> p = kBlowfishInitialP;
  std::array<std::array<std::uint32_t, 256>, 4> s = kBlowfishInitialS;

  std::uint32_t F(std::uint32_t x) const {
    return ((s[0][x >> 24] + s[1][(x >> 16) & 0xFF]) ^ s[2][(x >> 8) & 0xFF]) + s[3][x & 0xFF];
  }
};

namespace {

constexpr std::size_t kBlockSize = 8;

template <typename Transform>
bool ForEachBlock(const unsigned char* source, unsigned char* target, std::size_t length,
                  Transform transform) {
  if (length % kBlockSize != 0) return false;
  for (std::size_t at = 0; at < length; at += kBlockSize) {
    std::uint32_t left = LoadU32Le(source + at);
    std::uint32_t right = LoadU32Le(source + at + 4);
    transform(left, right);
    StoreU32Le(target + at, left);
    StoreU32Le(target + at + 4, right);
  }
  return true;
}

}  // namespace

BlowfishCipher::BlowfishCipher() : state_(std::make_unique<State>()) {}

BlowfishCipher::~BlowfishCipher() = default;

bool BlowfishCipher::SetKey(std::span<const unsigned char> key) {
  if (key.empty()) return false;
  *state_ = State{};
  std::size_t next = 0;
  for (std::uint32_t& entry : state_->p) {
    std::uint32_t bits = 0;
    for (int i = 0; i < 4; ++i) {
      bits = (bits << 8) | key[next];
      next = (next + 1) % key.size();
    }
    entry ^= bits;
  }
  std::uint32_t left = 0;
  std::uint32_t right = 0;
  for (std::size_t i = 0; i < state_->p.size(); i += 2) {
    EncipherHalves(left, right);
    state_->p[i] = left;
    state_->p[i + 1] = right;
  }
  for (auto& box : state_->s) {
    for (std::size_t i = 0; i < box.size(); i += 2) {
      EncipherHalves(left, right);
      box[i] = left;
      box[i + 1] = right;
    }
  }
  return true;
}

// Two rounds per step, so that the halves trade places by name instead of by swapping.
void BlowfishCipher::EncipherHalves(std::uint32_t& left, std::uint32_t& right) const {
  const State& state = *state_;
  std::uint32_t l = left;
  std::uint32_t r = right;
  for (std::size_t round = 0; round < 16; round += 2) {
    l ^= state.p[round];
    r ^= state.F(l);
    r ^= state.p[round + 1];
    l ^= state.F(r);
  }
  left = r ^ state.p[17];
  right = l ^ state.p[16];
}

void BlowfishCipher::DecipherHalves(std::uint32_t& left, std::uint32_t& right) const {
  const State& state = *state_;
  std::uint32_t l = left;
  std::uint32_t r = right;
  for (std::size_t round = 17; round > 1; round -= 2) {
    l ^= state.p[round];
    r ^= state.F(l);
    r ^= state.p[round - 1];
    l ^= state.F(r);
  }
  left = r ^ state.p[0];
  right = l ^ state.p[1];
}

bool BlowfishCipher::Encipher(const unsigned char* source, unsigned char* target,
                              std::size_t length) const {
  return ForEachBlock(source, target, length,
                      [this](std::uint32_t& l, std::uint32_t& r) { EncipherHalves(l, r); });
}

bool BlowfishCipher::Decipher(const unsigned char* source, unsigned char* target,
                              std::size_t length) const {
  return ForEachBlock(source, target, length,
                      [this](std::uint32_t& l, std::uint32_t& r) { DecipherHalves(l, r); });
}

}  // namespace kestrune::ui
