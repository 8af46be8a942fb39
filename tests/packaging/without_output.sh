#!/bin/bash
# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
# without_output.sh [--to-nowhere] COMMAND [ARGUMENT...]: succeeds where COMMAND succeeds and says nothing. A hint or
# warning that leaves the status at 0 fails all the same. With --to-nowhere only the standard error counts.
if [ "$1" = --to-nowhere ]; then
    shift
    said=$("$@" 2>&1 >/dev/null)
else
    said=$("$@" 2>&1)
fi
status=$?
if [ $status -ne 0 ] || [ -n "$said" ]; then
    printf 'status %d of: %s\n%s\n' $status "$*" "$said" >&2
    exit 1
fi
