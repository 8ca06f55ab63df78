# shellcheck shell=bash
# The environment of everything that runs under Wine here. Sourced, never run.
#
# Without mscoree and mshtml Wine does not offer to download them; without winemenubuilder a start menu's links stay in
# the machine; without winedbg a crashing program ends, with a status, instead of waiting for a debugger.

export WINEARCH=win64
export WINEDEBUG=-all
export WINEDLLOVERRIDES="mscoree,mshtml=;winemenubuilder.exe,winedbg.exe=d"
unset DISPLAY WAYLAND_DISPLAY

# wine_template DESKTOP: the folder of the template that machines are copies of; that of desktops when DESKTOP is not
# empty. It is made by scripts/wine-machine.
wine_template() {
    local found packages=(wine wine64)
    [[ -z $1 ]] || packages+=(fonts-dejavu-core fonts-dejavu-extra fonts-liberation fonts-wine)
    found=$(versions "${packages[@]}") || fail "packages are missing; scripts/setup installs them"
    printf '%s/wine-%s-%s' "$cache" "${1:+desktop-}template" \
        "$({ cat "$root"/scripts/wine-{machine,environment.sh} && printf '%s\n' "$found" "$(id -u)"; } | sha256sum | cut -c 1-16)"
}

# The fonts of a desktop: these folders and no other, so that a picture is the same on every host.
wine_desktop_fonts() {
    cat <<'FONTS'
<?xml version="1.0"?>
<!DOCTYPE fontconfig SYSTEM "fonts.dtd">
<fontconfig>
  <dir>/usr/share/fonts/truetype/dejavu</dir>
  <dir>/usr/share/fonts/truetype/liberation</dir>
</fontconfig>
FONTS
}

# wine_desktop_browser TEMPLATE: the program that stands for the user's browser.
wine_desktop_browser() { printf '%s/browser' "$1"; }
