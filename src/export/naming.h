#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "library/track.h"
#include "platform/files.h"

namespace kestrune {

inline constexpr std::u16string_view kUnknownName = u"Unknown";
inline constexpr std::u16string_view kUnknownArtist = u"Unknown Artist";
inline constexpr std::u16string_view kUnknownAlbum = u"Unknown Album";

// Names are cut to this many UTF-16 units.
inline constexpr std::size_t kNameLimit = 40;

// Removes leading and trailing U+0020 spaces; tabs and other white space stay.
void TrimSpaces(std::u16string& text);

// The cleaned form of a database text as one file or folder name: cut to 40 units (a surrogate
// pair the cut splits loses its first half), trimmed, "Unknown" when empty, the nine characters
// Windows refuses replaced by "_". Beyond that, so that the name is taken by the file system and
// stays inside its folder: control characters become "_", a name of only dots becomes
// "Unknown", trailing dots and spaces become "_", and on Windows a device name gets "_" in front.
std::u16string SanitizeName(std::u16string text);

// The cleaned file name without extension: the title, less the extension when the title ends
// with it in any ASCII letter case ("Song.MP3" for ".mp3" gives "Song").
std::u16string BaseNameFor(std::u16string_view title, std::u16string_view extension);

// The artist or album folder: the text, else "Unknown Artist" / "Unknown Album", cleaned.
std::u16string ArtistFolderName(const Track& track);
std::u16string AlbumFolderName(const Track& track);

// The last path component's part from its last dot, dot included; empty when it has none.
std::u16string ExtensionOf(std::u16string_view path);

// Where a track's copy goes: the output folder, in organized exports the artist and album
// folders, then the base name and the extension; numbered "[0]", "[1]" ... before the extension
// while the name is taken by anything other than a file of the track's exact size. Such a file
// counts as an earlier copy: `alreadyPresent` is then set. Creates the target's folder.
std::u16string TargetPathFor(const Track& track, std::u16string_view extension,
                             std::u16string_view outputFolder, bool organized,
                             platform::Files& files, bool& alreadyPresent);

}  // namespace kestrune
