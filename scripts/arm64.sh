#!/usr/bin/env bash
# arm64.sh PROGRAM [ARGUMENT...]: runs a program for 64-bit ARM Linux.
exec qemu-aarch64 -L /usr/aarch64-linux-gnu "$@"
