#pragma once

#include <cstddef>
#include <ostream>
#include <string>
#include <vector>

namespace kestrune::cli {

// A plain-text table: columns padded to their widest cell (up to a limit, longer cells cut with
// "…"), numbers right-aligned.
class TextTable {
 public:
  struct Column {
    std::u16string heading;
    bool rightAligned = false;
    std::size_t maximumWidth = 32;
  };

  explicit TextTable(std::vector<Column> columns);
  void AddRow(std::vector<std::u16string> cells);
  void Print(std::ostream& out) const;

 private:
  std::vector<Column> columns_;
  std::vector<std::vector<std::u16string>> rows_;
};

}  // namespace kestrune::cli
