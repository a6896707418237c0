#!/usr/bin/env python3
# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: LGPL-2.1-or-later
"""Rules of the tree that no compiler checks, over the C++ sources of the libraries, the daemon, the
applications and the plugins:

- every log line names its category: no bare qDebug/qInfo/qWarning/qCritical;
- a log message is one line: no "\\n" inside the text handed to a logging macro;
- download statuses and update states are compared by their names (InstallerProtocol), never as
  numbers: no `downloadStatus() == 3`, `status != 2`, `case 3:` in a switch over a status or state.

Prints each offence as file:line: rule, and exits 1 when there is one."""

import re
import sys
from pathlib import Path

ROOTS = ("src", "daemon", "apps", "plugins")
# Tests may log as they like, but they compare statuses by name too.
STATUS_ONLY_ROOTS = ("tests", "bench")
BARE_LOG = re.compile(r"(?<![\w:])q(Debug|Info|Warning|Critical)\s*\(")
CATEGORY_LOG = re.compile(r"\bqC(Debug|Info|Warning|Critical)\s*\(")
STATUS_LITERAL = re.compile(
    r"(downloadStatus\(\)|\b\w*(?:[sS]tatus|[sS]tate)\b(?:\(\))?|(?:StatusKey|StateKey)\)\.toLongLong\(\))"
    r"\s*(?:==|!=|<=|>=|<|>)\s*-?\d\b")
STATUS_SET_LITERAL = re.compile(
    r"(setDownloadStatus\(\s*-?\d|(?:DownloadStatusKey|UpdateStateKey),\s*(?:qint64\()?-?\d)")
SWITCH_ON_STATUS = re.compile(r"switch\s*\(.*(downloadStatus\(\)|StatusKey|StateKey)")
CASE_LITERAL = re.compile(r"^\s*case\s+-?\d+\s*:")


def logged_text(lines, start):
    """The text of the logging call that starts on line @p start, up to its closing parenthesis."""
    text = ""
    depth = 0
    for line in lines[start:start + 12]:
        for char in line:
            text += char
            if char == "(":
                depth += 1
            elif char == ")":
                depth -= 1
                if depth == 0:
                    return text
        text += " "
    return text


def check(path, offences, logging=True):
    lines = path.read_text(encoding="utf-8", errors="replace").splitlines()
    switch_depth = None  # brace depth of the innermost switch over a status, while inside it
    depth = 0
    for number, line in enumerate(lines, 1):
        code = line.split("//", 1)[0]
        if logging and BARE_LOG.search(code):
            offences.append(f"{path}:{number}: log line without a category")
        if logging and CATEGORY_LOG.search(code) and "\\n" in logged_text(lines, number - 1).split(",", 1)[-1]:
            offences.append(f"{path}:{number}: line break inside a log message")
        if STATUS_LITERAL.search(code) and "HttpStatusCode" not in code and "exitStatus" not in code:
            offences.append(f"{path}:{number}: status or state compared as a number")
        if STATUS_SET_LITERAL.search(code):
            offences.append(f"{path}:{number}: status or state given as a number")
        if SWITCH_ON_STATUS.search(code):
            switch_depth = depth
        if switch_depth is not None and CASE_LITERAL.match(code):
            offences.append(f"{path}:{number}: status or state case written as a number")
        depth += code.count("{") - code.count("}")
        if switch_depth is not None and depth <= switch_depth and "}" in code:
            switch_depth = None


def main():
    top = Path(sys.argv[1]) if len(sys.argv) > 1 else Path(__file__).resolve().parents[2]
    offences = []
    for root in ROOTS + STATUS_ONLY_ROOTS:
        for path in sorted((top / root).rglob("*")):
            if path.suffix in (".cpp", ".h") and path.is_file():
                check(path, offences, logging=root in ROOTS)
    for offence in offences:
        print(offence)
    return 1 if offences else 0


if __name__ == "__main__":
    sys.exit(main())
