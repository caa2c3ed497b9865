#!/usr/bin/env bash
# Builds, and writes a picture of every screen into docs/screenshots (or the folder given): light and dark, phone and
# tablet.
. "$(dirname "${BASH_SOURCE[0]}")/setup.sh"
configure release
build release quorl-screenshots
build/release/bin/quorl-screenshots "${1:-docs/screenshots}"
