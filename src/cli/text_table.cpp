#include "cli/text_table.h"

#include <algorithm>

#include "base/utf.h"

namespace kestrune::cli {
namespace {

// Characters as a terminal counts them, roughly: a surrogate pair is one.
std::size_t DisplayWidth(const std::u16string& text) {
  return static_cast<std::size_t>(std::count_if(
      text.begin(), text.end(), [](char16_t unit) { return unit < 0xDC00 || unit > 0xDFFF; }));
}

std::u16string Fit(const std::u16string& text, std::size_t width) {
  if (DisplayWidth(text) <= width) return text;
  std::u16string cut;
  std::size_t shown = 0;
  for (std::size_t i = 0; i < text.size() && shown + 1 < width; ++i) {
    cut += text[i];
    if (text[i] < 0xD800 || text[i] > 0xDBFF) ++shown;
  }
  if (!cut.empty() && cut.back() >= 0xD800 && cut.back() <= 0xDBFF) cut.pop_back();
  return cut + u"\u2026";
}

}  // namespace

TextTable::TextTable(std::vector<Column> columns) : columns_(std::move(columns)) {}

void TextTable::AddRow(std::vector<std::u16string> cells) {
  cells.resize(columns_.size());
  rows_.push_back(std::move(cells));
}

void TextTable::Print(std::ostream& out) const {
  std::vector<std::size_t> widths;
  for (const Column& column : columns_) widths.push_back(DisplayWidth(column.heading));
  for (const auto& row : rows_) {
    for (std::size_t c = 0; c < columns_.size(); ++c) {
      widths[c] = std::max(widths[c], std::min(DisplayWidth(row[c]), columns_[c].maximumWidth));
    }
  }
  auto printRow = [&](const std::vector<std::u16string>& cells) {
    std::string line;
    for (std::size_t c = 0; c < columns_.size(); ++c) {
      const std::u16string cell = Fit(cells[c], widths[c]);
      const std::string padding(widths[c] - DisplayWidth(cell), ' ');
      if (c > 0) line += "  ";
      line += columns_[c].rightAligned ? padding + EncodeUtf8(cell) : EncodeUtf8(cell) + padding;
    }
    while (!line.empty() && line.back() == ' ') line.pop_back();
    out << line << '\n';
  };
  std::vector<std::u16string> headings;
  for (const Column& column : columns_) headings.push_back(column.heading);
  printRow(headings);
  for (const auto& row : rows_) printRow(row);
}

}  // namespace kestrune::cli
