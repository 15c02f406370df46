#!/usr/bin/env python3
"""Doxygen input filter for the public headers.

The headers are written to be read as plain C: a routine's block opens with
`/** name -- what it does.` and goes on with an aligned table of arguments, results,
codes, frames and state. This filter keeps every word and changes only the layout the
manual shows:
  - a block `/** name -- lead sentence ...` gets the lead sentence (up to its full stop) as
    its brief description, and the rest of the block in fixed width, so the aligned tables
    stay aligned;
  - declarations that follow one another without a blank line share the block above the
    first of them;
  - a section banner (a comment framed by rules of '=' or '-') becomes a named member group,
    so the manual lists the routines under the header's own sections;
  - a plain file comment `/* dir/file.h -- title ...` becomes the file's documentation, and
    a plain comment right above a typedef or a declaration documents it as a block does.
Everything else goes through unchanged. Usage: doxy_filter.py HEADER (writes to stdout).
"""
import re
import sys

ROUTINE_BLOCK = re.compile(r"^/\*\*\s+([A-Za-z_]\w*(?:\s*,\s*[A-Za-z_]\w*)*)\s+--\s")
FILE_COMMENT = re.compile(r"^/\*(?!\*)\s+([\w./-]+\.h)\s+--\s+(.*)$", re.S)
RULE = re.compile(r"^[=\-]{10,}$")
DECLARATION = re.compile(r"^ORVQ7_\w*API\s+(.*)$")
FUNCTION_NAME = re.compile(r"([A-Za-z_]\w*)\s*\(")
SPECIAL = re.compile(r"([\\@<>&#$%])")


def comment_lines(text):
    """The text lines of a comment, without the opening, closing and leading '*'."""
    body = text.strip()
    body = re.sub(r"^/\*+", "", body)
    body = re.sub(r"\*+/$", "", body)
    lines = []
    for line in body.split("\n"):
        lines.append(re.sub(r"^\s*\*(?!/) ?", "", line).rstrip())
    while lines and not lines[0].strip():
        lines.pop(0)
    while lines and not lines[-1].strip():
        lines.pop()
    return lines


def escape_prose(text):
    """Doxygen's special characters taken literally, except inside `code spans`."""
    parts = text.split("`")
    for i in range(0, len(parts), 2):
        parts[i] = SPECIAL.sub(r"\\\1", parts[i])
    return "`".join(parts)


def routine_block(text):
    lines = comment_lines(text)
    lines[0] = re.sub(r"^\s+", "", lines[0])
    # The lead: the first line and the lines that finish its sentence.
    lead = [lines[0]]
    i = 1
    while i < len(lines) and not lead[-1].rstrip().endswith(".") and lines[i].strip() \
            and not lines[i].startswith("  "):
        lead.append(lines[i].strip())
        i += 1
    # A full stop inside the lead does not end the brief description.
    brief = re.sub(r"\.(\s+)(?=\S)", r".\\\1", escape_prose(" ".join(x.strip() for x in lead)))
    out = ["/** \\brief " + brief]
    rest = lines[i:]
    if rest:
        # Verbatim lines carry no leading '*', which Doxygen would keep.
        out.append("\\verbatim")
        out.extend(rest)
        out.append("\\endverbatim")
    out.append("*/")
    return "\n".join(out)


def banner(text):
    """Title and description of a section banner, or None when the comment is not one."""
    lines = comment_lines(text)
    if len(lines) < 3 or not RULE.match(lines[0].strip()) or not RULE.match(lines[-1].strip()):
        return None
    inner = [x.strip() for x in lines[1:-1] if x.strip() and not RULE.match(x.strip())]
    if not inner:
        return None
    return inner[0], inner[1:]


def file_comment(text):
    m = FILE_COMMENT.match(text.strip())
    if not m:
        return None
    lines = comment_lines(text)
    lines[0] = m.group(2).split("\n")[0].strip()
    brief = []
    i = 0
    while i < len(lines) and lines[i].strip():
        brief.append(lines[i].strip())
        i += 1
    out = ["/** \\file", " * \\brief " + escape_prose(" ".join(brief))]
    out.extend((" * " + x).rstrip() for x in lines[i:])
    out.append(" */")
    return "\n".join(out)


def split_items(source):
    """Splits the source into comments and code, keeping every character."""
    items = []
    pos = 0
    for m in re.finditer(r"/\*.*?\*/|//[^\n]*|\"(?:\\.|[^\"\\])*\"", source, re.S):
        if m.group(0).startswith("\""):
            continue
        if m.start() > pos:
            items.append(("code", source[pos:m.start()]))
        items.append(("comment", m.group(0)))
        pos = m.end()
    if pos < len(source):
        items.append(("code", source[pos:]))
    return items


def filter_header(source):
    out = []
    group_open = False
    seen_code = False
    documented = False     # a doc block was emitted since the last declaration
    last_decl = None       # name of the last declaration, when it shared in a block
    pending_decl = ""      # declaration text read so far (it may span several lines)

    def close_group():
        nonlocal group_open
        if group_open:
            out.append("/** @} */\n")
            group_open = False

    items = split_items(source)
    for index, (kind, text) in enumerate(items):
        if kind == "comment":
            if not seen_code and file_comment(text) is not None:
                out.append(file_comment(text))
                continue
            b = banner(text) if text.startswith("/*") and not text.startswith("/**") else None
            if b is not None:
                close_group()
                title, description = b
                doc = "/** \\name " + escape_prose(title)
                if description:
                    doc += "\n * " + "\n * ".join(escape_prose(x) for x in description)
                out.append(doc + " */\n/** @{ */")
                group_open = True
                documented = False
                last_decl = None
                continue
            if ROUTINE_BLOCK.match(text):
                out.append(routine_block(text))
                documented = True
                continue
            if text.startswith("/**") and not text.startswith("/**<"):
                documented = True
            elif text.startswith("/*") and documents_next(items, index):
                # A plain comment right above a declaration describes it.
                out.append(routine_block(text))
                documented = True
                continue
            out.append(text)
            continue
        # Code: watch the declarations line by line.
        lines = text.split("\n")
        for k, line in enumerate(lines):
            stripped = line.strip()
            if stripped:
                seen_code = True
            if pending_decl:
                pending_decl += " " + stripped
            else:
                m = DECLARATION.match(stripped)
                if m:
                    if not documented and last_decl is not None and out_tail_is_adjacent(out):
                        out.append("/** \\copydoc " + last_decl + " */\n")
                    pending_decl = stripped
            if pending_decl and pending_decl.endswith(";"):
                name = FUNCTION_NAME.search(pending_decl)
                last_decl = name.group(1) if name and "extern" not in pending_decl.split("(")[0] \
                    else None
                documented = False
                pending_decl = ""
            if stripped in ("ORVQ7_END_DECLS", "#ifdef __cplusplus") and group_open:
                close_group()
                out.append("\n")
            if not stripped and k not in (0, len(lines) - 1):
                last_decl = None
            out.append(line + ("\n" if k < len(lines) - 1 else ""))
    close_group()
    return "".join(out)


def documents_next(items, index):
    """True when the code right after comment `index` (no blank line between) is a typedef
    or an exported declaration."""
    if index + 1 >= len(items) or items[index + 1][0] != "code":
        return False
    m = re.match(r"[ \t]*\n[ \t]*(\S[^\n]*)", items[index + 1][1])
    return bool(m) and (m.group(1).startswith("typedef ") or bool(DECLARATION.match(m.group(1))))


def out_tail_is_adjacent(out):
    """True when no blank line separates the previous declaration from this one."""
    tail = "".join(out[-3:])
    return not re.search(r"\n[ \t]*\n[ \t]*$", tail)


def main():
    with open(sys.argv[1], encoding="utf-8") as f:
        source = f.read()
    if sys.argv[1].endswith(".h"):
        source = filter_header(source)
    sys.stdout.write(source)


if __name__ == "__main__":
    main()
