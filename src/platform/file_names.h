#pragma once

#include <string>
#include <string_view>

namespace kestrune::platform {

// The nine characters Windows refuses in a name (the separators among them) each become "_".
void ReplaceReservedCharacters(std::u16string& name);

// Windows' device names (CON, PRN, AUX, NUL, COM1 to COM9, LPT1 to LPT9), in any letter case,
// alone or before an extension ("nul.mp3"): such a file name opens the device, not a file.
bool IsReservedDeviceName(std::u16string_view name);

#ifdef _WIN32
inline constexpr bool kDeviceNamesReserved = true;
#else
inline constexpr bool kDeviceNamesReserved = false;
#endif

// Makes a name that the file system takes and that names an entry inside its folder: units below
// U+0020 become "_"; an empty name or one of only dots becomes `fallback`; trailing dots and
// spaces (which Windows drops) become "_"; where device names are reserved, one gets "_" in front.
std::u16string MakeNameAcceptable(std::u16string name, std::u16string_view fallback);

}  // namespace kestrune::platform
