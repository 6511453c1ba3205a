#!/bin/sh
# Runs a command on a virtual X display (xvfb-run). Exits 77, which ctest counts as skipped,
# when xvfb-run is not installed (Debian packages xvfb and xauth; scripts/bootstrap adds them).
if ! command -v xvfb-run >/dev/null 2>&1; then
  echo "SKIPPED: xvfb-run is not installed (Debian packages xvfb and xauth); no window was tested" >&2
  exit 77
fi
exec xvfb-run -a -s "-screen 0 1280x1024x24 -nolisten tcp" "$@"
