#!/bin/sh
# Runs a Windows program under Wine on a virtual screen. WINEPATH must name the folders of the
# library and of the compiler's runtime; ./dev sets it.
exec xvfb-run -a wine "$@"
