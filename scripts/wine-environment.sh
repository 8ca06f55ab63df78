# shellcheck shell=bash
# The environment of everything that runs under Wine here. Sourced, never run.
#
# Without mscoree and mshtml Wine does not offer to download them; without winemenubuilder a start menu's links stay in
# the machine; without winedbg a crashing program ends, with a status, instead of waiting for a debugger.

export WINEARCH=win64
export WINEDEBUG=-all
export WINEDLLOVERRIDES="mscoree,mshtml=;winemenubuilder.exe,winedbg.exe=d"
unset DISPLAY WAYLAND_DISPLAY
