#!/bin/sh
# The headers' comments above declarations start with "/* "; doxygen reads
# them as documentation when they start with "/** ". Section rules
# ("/* ---- ... */") stay plain comments.
exec sed -e 's|^/\* \([^-]\)|/** \1|' -e 's|^  /\* \([^-]\)|  /** \1|' "$1"
