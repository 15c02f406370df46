#!/usr/bin/env python3
"""Writes the generated pages of the manual.

Usage: gen_pages.py FRAME_HEADER EXAMPLES_DIR OUTPUT_DIR
  error_codes.md  the table of status codes, one row per enumerator of enum Orvq7Code
                  (`NAME = number, /**< meaning */`, the meaning over one or more lines),
                  in the order of the header;
  examples.dox    one entry per example program (examples/<language>/<file>), described by
                  the first paragraph of its file comment.
"""
import os
import re
import sys

ERRORS_INTRO = """# Error codes {#error_codes}

Routines that can fail return 1 and put one of these codes in their last argument (`ierr`);
on success they return 0. A code means the same thing in every routine that sets it, and
its number never changes: callers compare against the numbers. Where a routine gives a
code a meaning of its own, its block says so. A failing routine may also record one
traceback frame (the code and the routine's 8-byte name) with `bftier`: see
\\ref platform_services. At run time, `orvq7sys_code_text(code)` gives the meaning of any
code. The names are the enumerators of `enum Orvq7Code` in frame/frame_api.h; the Fortran
module declares them as integer parameters of the same names.

| Code | Name | Meaning |
|-----:|------|---------|
"""

EXAMPLES_INTRO = """/** \\page examples_page Examples
Programs in C, C++ and Fortran that use the installed library; CI builds each of them
against an installed tree with find_package and runs it (examples/ in the source tree).
*/
"""


def error_rows(text):
    m = re.search(r"enum\s+Orvq7Code\s*\{(.*?)\};", text, re.S)
    if not m:
        raise SystemExit("gen_pages.py: no enum Orvq7Code")
    rows = []
    for e in re.finditer(r"\b(ORVQ7_\w+)\s*=\s*(-?\d+)\s*,?\s*(?:/\*\*<(.*?)\*/)?",
                         m.group(1), re.S):
        meaning = " ".join((e.group(3) or "").split()).replace("|", "\\|")
        rows.append("| %s | `%s` | %s |" % (e.group(2), e.group(1), meaning))
    return rows


def opening_comment(path):
    """The opening comment of a source file (its first paragraph), without the file name."""
    words = []
    with open(path, encoding="utf-8") as f:
        for line in f:
            line = re.sub(r"^\s*(/\*+|\*+(?!/)|//+|!+)\s?", "", line.rstrip())
            line = re.sub(r"\s*\*/\s*$", "", line)
            if not line.strip():
                break
            words += line.split()
            if re.search(r"[.:;]$", line):
                break
    text = " ".join(words)
    text = re.sub(r"^\S+\s+--\s+", "", text)
    return re.sub(r"[:;]$", ".", text)


def main():
    header, examples_dir, out_dir = sys.argv[1:4]
    os.makedirs(out_dir, exist_ok=True)
    with open(header, encoding="utf-8") as f:
        page = ERRORS_INTRO + "\n".join(error_rows(f.read())) + "\n"
    write_if_changed(os.path.join(out_dir, "error_codes.md"), page)
    entries = [EXAMPLES_INTRO]
    for lang in sorted(os.listdir(examples_dir)):
        folder = os.path.join(examples_dir, lang)
        if not os.path.isdir(folder):
            continue
        for name in sorted(os.listdir(folder)):
            if name.endswith((".c", ".cpp", ".f90")):
                entries.append("/** \\example %s/%s\n%s */\n"
                               % (lang, name, opening_comment(os.path.join(folder, name))))
    write_if_changed(os.path.join(out_dir, "examples.dox"), "".join(entries))


def write_if_changed(path, text):
    try:
        with open(path, encoding="utf-8") as f:
            if f.read() == text:
                return
    except OSError:
        pass
    with open(path, "w", encoding="utf-8") as f:
        f.write(text)


if __name__ == "__main__":
    main()
