#pragma once

#include <span>
#include <string>
#include <vector>

namespace kestrune::compoundfile {

struct NamedStream {
  std::u16string name;
  std::vector<unsigned char> bytes;
};

// A version 3 compound file (512-byte sectors) whose root storage holds exactly these streams:
// streams under 4096 bytes in the mini stream, the others in sectors of their own, the sibling
// tree balanced and coloured so that ole32 finds every name.
//
// Names are 1 to 31 printable ASCII characters other than '/', '\\', ':' and '!', unique when
// a–z and A–Z are taken alike; only for ASCII is the tree's order certain to be ole32's.
// Throws std::invalid_argument for a name outside that, std::length_error for a stream of
// 2 GB or more.
std::vector<unsigned char> WriteCompoundFile(std::span<const NamedStream> streams);

}  // namespace kestrune::compoundfile
