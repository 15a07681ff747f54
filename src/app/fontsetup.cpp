#include "app/fontsetup.h"

#include <fontconfig/fontconfig.h>

#include <system_error>

namespace {

// Every family falls back to the interface's font, then to one with the signs of most scripts, the
// ideographs, Korean, the emoji, and at last whatever there is. Each font costs every look-up a
// little: out go those that no caption needs (Tibetan has no other), and bitmaps but for the emoji.
constexpr char CONFIGURATION[] = R"(<?xml version="1.0"?>
<fontconfig>
  <dir>/usr/share/fonts</dir>
  <dir>/usr/local/share/fonts</dir>
  <dir prefix="xdg">fonts</dir>
  <cachedir>/var/cache/fontconfig</cachedir>
  <cachedir prefix="xdg">fontconfig</cachedir>
  <include ignore_missing="yes">/etc/fonts/local.conf</include>
  <match target="pattern">
    <edit name="family" mode="append_last">
      <string>Inter</string>
      <string>Noto Sans</string>
      <string>Droid Sans Fallback</string>
      <string>NanumGothic</string>
      <string>Noto Color Emoji</string>
    </edit>
    <edit name="antialias" mode="append"><bool>true</bool></edit>
    <edit name="hintstyle" mode="append"><const>hintslight</const></edit>
    <edit name="lcdfilter" mode="append"><const>lcddefault</const></edit>
  </match>
  <selectfont>
    <acceptfont><glob>*/NotoSerifTibetan*</glob></acceptfont>
    <rejectfont>
      <glob>*/type1/*</glob>
      <glob>*/Type1/*</glob>
      <glob>*/urw-base35/*</glob>
      <glob>*Mono*</glob>
      <glob>*Serif*</glob>
      <glob>*Display*</glob>
      <glob>*Condensed*</glob>
    </rejectfont>
    <rejectfont><pattern>
      <patelt name="scalable"><bool>false</bool></patelt>
      <patelt name="color"><bool>false</bool></patelt>
    </pattern></rejectfont>
  </selectfont>
</fontconfig>
)";

void useOwnConfiguration()
{
    FcConfig *config = FcConfigCreate();
    if (!config)
        return;
    const auto *text = reinterpret_cast<const FcChar8 *>(CONFIGURATION);
    if (FcConfigParseAndLoadFromMemory(config, text, FcTrue) && FcConfigBuildFonts(config))
        FcConfigSetCurrent(config);
    FcConfigDestroy(config);
}

} // namespace

FontSetup::FontSetup()
{
    try {
        mThread = std::thread(useOwnConfiguration);
    } catch (const std::system_error &) {
        useOwnConfiguration(); // no thread to be had
    }
}

void FontSetup::finish()
{
    if (mThread.joinable())
        mThread.join();
}
