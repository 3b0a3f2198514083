# Sourced by the scripts that run Windows programs: a Wine prefix of the project's own under
# build/, a virtual X server, and no host integration. Safe to source more than once.
top=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)
export WINEPREFIX="$top/build/wine-prefix"
export WINEARCH=win64
export WINEDEBUG=-all
export WINEDLLOVERRIDES="mscoree,mshtml=;winemenubuilder.exe=d"

if [ -z "${KESTRUNE_XVFB_STARTED:-}" ]; then
  display=:97
  if ! xdpyinfo -display "$display" >/dev/null 2>&1; then
    Xvfb "$display" -screen 0 1280x1024x24 -nolisten tcp >/dev/null 2>&1 &
    export KESTRUNE_XVFB_PID=$!
    for _ in $(seq 50); do xdpyinfo -display "$display" >/dev/null 2>&1 && break; sleep 0.1; done
  fi
  export DISPLAY=$display KESTRUNE_XVFB_STARTED=1
fi

if [ ! -f "$WINEPREFIX/.kestrune-ready" ]; then
  rm -rf "$WINEPREFIX"
  mkdir -p "$WINEPREFIX"
  wineboot -i >/dev/null 2>&1
  wineserver -w
  # Wine links the user folders (Music, Documents, Desktop ...) to $HOME: keep them in the prefix.
  for link in "$WINEPREFIX"/drive_c/users/*/*; do
    if [ -L "$link" ]; then rm "$link" && mkdir "$link"; fi
  done
  # Without a window manager, destroying a managed window stalls for two seconds.
  wine reg add 'HKCU\Software\Wine\X11 Driver' /v Managed /t REG_SZ /d N /f >/dev/null 2>&1
  wineserver -w
  touch "$WINEPREFIX/.kestrune-ready"
fi

# The persistent server keeps the prefix's services (services.exe, winedevice.exe ...) running,
# and they hold on to the output of the program that started them: ctest would wait for that
# test's output to end for ever. Start them here, writing nowhere.
wine_start_services() {
  wine cmd /c exit </dev/null >/dev/null 2>&1 || true
}

# One server for the whole run: Windows programs started side by side (ctest -j2) would
# otherwise race to start it, and one of them can lose its connection.
wineserver -p 2>/dev/null || true
wine_start_services

# Maps a folder to a drive letter that Windows programs see as removable media.
wine_map_removable_drive() {
  local letter=$1 folder=$2
  ln -sfn "$folder" "$WINEPREFIX/dosdevices/$letter:"
  wine reg add 'HKLM\Software\Wine\Drives' /v "$letter:" /t REG_SZ /d floppy /f >/dev/null 2>&1
  # The drive type is read when the wine server starts.
  wineserver -k 2>/dev/null || true
  wineserver -w
  wineserver -p 2>/dev/null || true
  wine_start_services
}

# Stops what this file started: the wine server and, if it started one, the X server.
wine_env_stop() {
  wineserver -k 2>/dev/null || true
  if [ -n "${KESTRUNE_XVFB_PID:-}" ]; then kill "$KESTRUNE_XVFB_PID" 2>/dev/null || true; fi
}

wine_unmap_drive() {
  local letter=$1
  rm -f "$WINEPREFIX/dosdevices/$letter:"
  wine reg delete 'HKLM\Software\Wine\Drives' /v "$letter:" /f >/dev/null 2>&1 || true
  wineserver -k 2>/dev/null || true
  wineserver -w
  wineserver -p 2>/dev/null || true
  wine_start_services
}
