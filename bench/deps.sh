#!/usr/bin/env bash
# Installs Debian's cython3 for the Cython column of `make bench` when it is
# missing. Without root, says so and lets the benchmarks run without it.
set -euo pipefail
command -v cython3 >/dev/null 2>&1 && exit 0
if [ "$(id -u)" -ne 0 ]; then
  echo "bench: cython3 is missing; run as root to install it (the Cython column stays empty)" >&2
  exit 0
fi
export DEBIAN_FRONTEND=noninteractive
get_cython() { apt-get install -y -qq --no-install-recommends cython3 </dev/null; }
get_cython || { apt-get update -qq && get_cython; }
