#pragma once

#include <array>
#include <cstdint>

namespace kestrune::ui {

extern const std::array<std::uint32_t, 18> kBlowfishInitialP;
extern const std::array<std::array<std::uint32_t, 256>, 4> kBlowfishInitialS;

}  // namespace kestrune::ui
