#!/bin/sh
# Runs a Windows program under Wine. WINEPATH must name the folders of the library and of the compiler's runtime;
# ./dev sets it, and starts one virtual screen for all programs of a run. Without ./dev each gets its own.
if [ -n "$QXCORE_XVFB" ]; then
  exec wine "$@"
fi
exec xvfb-run -a wine "$@"
