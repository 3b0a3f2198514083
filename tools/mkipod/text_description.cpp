#include "mkipod/text_description.h"

#include <stdexcept>
#include <string>
#include <vector>

#include "base/text.h"
#include "base/utf.h"

namespace kestrune::mkipod {
namespace {

struct Token {
  std::string key;
  std::u16string value;  // the text after '=', unquoted and unescaped
  bool hasValue = false;
};

[[noreturn]] void Fail(std::size_t line, const std::string& what) {
  throw std::runtime_error("line " + std::to_string(line) + ": " + what);
}

std::u16string Unquote(std::string_view raw, std::size_t line) {
  if (raw.empty() || raw.front() != '"') return DecodeUtf8(raw);
  if (raw.size() < 2 || raw.back() != '"') Fail(line, "unterminated quote");
  std::u16string out;
  const std::string_view inner = raw.substr(1, raw.size() - 2);
  std::string plain;
  auto flush = [&] {
    out += DecodeUtf8(plain);
    plain.clear();
  };
  for (std::size_t i = 0; i < inner.size(); ++i) {
    if (inner[i] != '\\') {
      plain += inner[i];
      continue;
    }
    if (i + 1 >= inner.size()) Fail(line, "lone backslash");
    const char escaped = inner[++i];
    if (escaped == 'u') {
      if (i + 4 >= inner.size()) Fail(line, "short \\u escape");
      const std::string hex(inner.substr(i + 1, 4));
      if (hex.size() != 4 || hex.find_first_not_of("0123456789abcdefABCDEF") != std::string::npos) {
        Fail(line, "bad \\u escape");
      }
      flush();
      out += static_cast<char16_t>(std::stoul(hex, nullptr, 16));
      i += 4;
    } else {
      plain += escaped;
    }
  }
  flush();
  return out;
}

std::vector<Token> Tokenize(std::string_view text, std::size_t line) {
  std::vector<Token> tokens;
  std::size_t i = 0;
  while (i < text.size()) {
    while (i < text.size() && (text[i] == ' ' || text[i] == '\t')) ++i;
    if (i >= text.size() || text[i] == '#') break;
    const std::size_t start = i;
    bool quoted = false;
    while (i < text.size() && (quoted || (text[i] != ' ' && text[i] != '\t'))) {
      if (text[i] == '\\' && quoted) {
        i += 2;
        continue;
      }
      if (text[i] == '"') quoted = !quoted;
      ++i;
    }
    if (quoted) Fail(line, "unterminated quote");
    const std::string_view word = text.substr(start, std::min(i, text.size()) - start);
    Token token;
    const std::size_t equals = word.find('=');
    if (equals == std::string_view::npos || word.front() == '"') {
      token.key = std::string(word.front() == '"' ? "" : word);
      if (word.front() == '"') token.value = Unquote(word, line), token.hasValue = true;
    } else {
      token.key = std::string(word.substr(0, equals));
      token.value = Unquote(word.substr(equals + 1), line);
      token.hasValue = true;
    }
    tokens.push_back(std::move(token));
  }
  return tokens;
}

std::uint32_t Number(const std::u16string& text, std::size_t line) {
  const auto value = ParseDecimalU32(text);
  if (!value) Fail(line, "not a number: " + EncodeUtf8(text));
  return *value;
}

// "TYPE:rest" values of mhod=, raw-mhod=, unknown=.
std::pair<std::u16string, std::u16string> SplitPair(const std::u16string& text, std::size_t line) {
  const std::size_t colon = text.find(u':');
  if (colon == std::u16string::npos) Fail(line, "expected A:B in " + EncodeUtf8(text));
  return {text.substr(0, colon), text.substr(colon + 1)};
}

UnknownRecord Unknown(const std::u16string& value, std::size_t line) {
  const auto [tag, length] = SplitPair(value, line);
  if (tag.size() != 4) Fail(line, "a tag has four letters");
  UnknownRecord record{EncodeUtf8(tag), Number(length, line)};
  if (record.headerLength < 12) Fail(line, "a record header has at least 12 bytes");
  return record;
}

std::vector<std::uint32_t> IdList(const std::u16string& text, std::size_t line) {
  std::vector<std::uint32_t> ids;
  std::size_t start = 0;
  while (start <= text.size() && !text.empty()) {
    std::size_t comma = text.find(u',', start);
    if (comma == std::u16string::npos) comma = text.size();
    ids.push_back(Number(text.substr(start, comma - start), line));
    start = comma + 1;
  }
  return ids;
}

TrackDescription ParseTrack(const std::vector<Token>& tokens, std::size_t line) {
  TrackDescription track;
  for (std::size_t i = 1; i < tokens.size(); ++i) {
    const Token& t = tokens[i];
    if (t.key == "id")
      track.id = Number(t.value, line);
    else if (t.key == "title")
      track.title = t.value;
    else if (t.key == "artist")
      track.artist = t.value;
    else if (t.key == "album")
      track.album = t.value;
    else if (t.key == "genre")
      track.genre = t.value;
    else if (t.key == "location")
      track.location = t.value;
    else if (t.key == "length")
      track.lengthMs = Number(t.value, line);
    else if (t.key == "size")
      track.size = Number(t.value, line);
    else if (t.key == "utf8")
      track.utf8 = true;
    else if (t.key == "odd")
      track.oddLengthTypes.push_back(Number(t.value, line));
    else if (t.key == "unknown")
      track.unknownRecords.push_back(Unknown(t.value, line));
    else if (t.key == "mhod") {
      const auto [type, text] = SplitPair(t.value, line);
      track.moreStrings.push_back({Number(type, line), Unquote(EncodeUtf8(text), line)});
    } else if (t.key == "raw-mhod") {
      const auto [type, length] = SplitPair(t.value, line);
      track.rawRecords.push_back({Number(type, line), Number(length, line)});
    } else if (t.key == "media") {
      if (t.value == u"none")
        track.media = MediaKind::kNone;
      else if (t.value == u"bytes")
        track.media = MediaKind::kFiller;
      else if (t.value.starts_with(u"tone:")) {
        track.media = MediaKind::kTone;
        track.toneHz = Number(t.value.substr(5), line);
      } else
        Fail(line, "media is tone:HZ, bytes or none");
    } else
      Fail(line, "unknown track field " + t.key);
  }
  return track;
}

PlaylistDescription ParsePlaylist(const std::vector<Token>& tokens, std::size_t line) {
  PlaylistDescription playlist;
  for (std::size_t i = 1; i < tokens.size(); ++i) {
    const Token& t = tokens[i];
    if (t.key == "name")
      playlist.name = t.value;
    else if (t.key == "ids")
      playlist.itemIds = IdList(t.value, line);
    else if (t.key == "master")
      playlist.master = true;
    else if (t.key == "positions")
      playlist.positions = true;
    else
      Fail(line, "unknown playlist field " + t.key);
  }
  return playlist;
}

DataSetDescription ParseDataSet(const std::vector<Token>& tokens, std::size_t line) {
  DataSetDescription set;
  for (std::size_t i = 1; i < tokens.size(); ++i) {
    const Token& t = tokens[i];
    if (t.key == "type")
      set.type = Number(t.value, line);
    else if (t.key == "photo")
      set.photoTree = true;
    else if (t.key == "unknown")
      set.unknownRecords.push_back(Unknown(t.value, line));
    else
      Fail(line, "unknown dataset field " + t.key);
  }
  return set;
}

}  // namespace

DeviceDescription ParseDescription(std::string_view text) {
  DeviceDescription device;
  std::size_t line = 0;
  while (!text.empty()) {
    ++line;
    const std::size_t end = text.find('\n');
    std::string_view current = text.substr(0, end);
    text = end == std::string_view::npos ? std::string_view() : text.substr(end + 1);
    if (!current.empty() && current.back() == '\r') current.remove_suffix(1);
    const std::vector<Token> tokens = Tokenize(current, line);
    if (tokens.empty()) continue;
    const std::string& kind = tokens.front().key;
    if (kind == "device") {
      if (tokens.size() != 2 || !tokens[1].hasValue || !tokens[1].key.empty()) {
        Fail(line, "device takes one quoted name");
      }
      device.deviceName = tokens[1].value;
    } else if (kind == "track") {
      device.tracks.push_back(ParseTrack(tokens, line));
    } else if (kind == "playlist") {
      device.playlists.push_back(ParsePlaylist(tokens, line));
    } else if (kind == "dataset") {
      device.moreDataSets.push_back(ParseDataSet(tokens, line));
    } else {
      Fail(line, "unknown item " + kind);
    }
  }
  return device;
}

}  // namespace kestrune::mkipod
