#include "cli/terminal_display.h"

#include "base/utf.h"

namespace kestrune::cli {
namespace {

constexpr std::size_t kBarWidth = 20;

// Program texts may hold line breaks (the library message does); a terminal line may not.
std::u16string OneLine(std::u16string_view text) {
  std::u16string line;
  for (char16_t unit : text) {
    if (unit == u'\r') continue;
    line += unit < u' ' ? u' ' : unit;
  }
  return line;
}

}  // namespace

TerminalDisplay::TerminalDisplay(Choices choices, bool terminal, int columns, std::ostream& out,
                                 std::ostream& err)
    : choices_(std::move(choices)),
      terminal_(terminal),
      columns_(columns > 1 ? static_cast<std::size_t>(columns) : 80),
      out_(out),
      err_(err) {}

bool TerminalDisplay::IsTicked(ExportOption option) {
  return option == ExportOption::kOrganized ? choices_.organized : choices_.rebuildPlaylists;
}

void TerminalDisplay::ShowMessage(std::u16string_view text, std::u16string_view title) {
  if (lineOpen_) out_ << '\n' << std::flush;
  lineOpen_ = false;
  err_ << "kestrune-cli: " << EncodeUtf8(OneLine(title)) << ": " << EncodeUtf8(OneLine(text))
       << '\n';
}

void TerminalDisplay::ShowProgress(const ProgressView& progress) {
  std::u16string line = progress.titleLine;
  if (!progress.item.empty()) line += u" " + OneLine(progress.item);
  if (!terminal_) {
    out_ << EncodeUtf8(line) << '\n';
    return;
  }
  const std::size_t filled = progress.total == 0 ? 0 : kBarWidth * progress.done / progress.total;
  std::u16string bar =
      u"[" + std::u16string(filled, u'#') + std::u16string(kBarWidth - filled, u' ') + u"] ";
  line = bar + line;
  // One terminal line, redrawn in place: cut to the width, then blank out what the last one left.
  const std::size_t width = columns_ - 1;
  if (line.size() > width) {
    line.resize(width);
    if (line.back() >= 0xD800 && line.back() <= 0xDBFF) line.pop_back();
  }
  line.append(width - line.size(), u' ');
  out_ << '\r' << EncodeUtf8(line) << std::flush;
  lineOpen_ = true;
}

void TerminalDisplay::ShowFinish() {
  if (lineOpen_) out_ << '\n';
  lineOpen_ = false;
}

}  // namespace kestrune::cli
