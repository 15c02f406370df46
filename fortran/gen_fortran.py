#!/usr/bin/env python3
"""Writes a Fortran module of bind(C) interfaces from C headers.

Usage: gen_fortran.py --module NAME --output FILE [--macro M]... HEADER...

Reads the declarations that start with one of the export marks (default: every ORVQ7_*API),
with their continuation lines up to the closing ';', and writes one interface per routine:
  int32_t, int       integer(c_int)        int64_t  integer(c_int64_t)
  int16_t, int8_t    integer(c_int16_t), integer(c_int8_t) (unsigned: the same kinds)
  double, float      real(c_double), real(c_float)          size_t   integer(c_size_t)
  T*                 by reference; a "const" pointee gives intent(in), else intent(inout)
  T  (no pointer)    value
  char*              character(kind=c_char) :: name(*)
  void*              type(c_ptr), value    T**      type(c_ptr) (by reference)
  struct S*          type(c_ptr), value (an opaque record: pass its address)
  function pointer   type(c_funptr), value (pass c_funloc of a bind(C) procedure)
  enum type          integer(c_int)
A pointer to a number is an array (*) when the routine's block lists the argument with a
shaped type in its argument table (`x  in  real(n)`, `a, b  in  real(3)`,
`t  in/out  int32(k, m)`, `base  in  array`), and a scalar otherwise. Numeric #defines
and enumerators named ORVQ7... become integer parameters. Anything the generator cannot map
stops it with a message naming the declaration, so no interface is ever guessed.
"""
import argparse
import re
import sys

# Fortran has no unsigned integers: an unsigned type maps to the signed kind of its size.
C_INT_TYPES = {"int32_t": "integer(c_int)", "int": "integer(c_int)",
               "uint32_t": "integer(c_int)", "int64_t": "integer(c_int64_t)",
               "uint64_t": "integer(c_int64_t)", "int16_t": "integer(c_int16_t)",
               "uint16_t": "integer(c_int16_t)", "int8_t": "integer(c_int8_t)",
               "uint8_t": "integer(c_int8_t)", "size_t": "integer(c_size_t)",
               "double": "real(c_double)", "float": "real(c_float)"}
C_KINDS = ["c_int", "c_int8_t", "c_int16_t", "c_int64_t", "c_size_t", "c_double", "c_float",
           "c_char", "c_ptr", "c_funptr"]
C_KEYWORDS = {"const", "volatile", "restrict", "struct", "enum", "unsigned", "signed",
              "void", "char", "int", "double", "float"} | set(C_INT_TYPES)
MAX_LINE = 100


class HeaderError(Exception):
    pass


def strip_comments(text):
    return re.sub(r"/\*.*?\*/|//[^\n]*", " ", text, flags=re.S)


NAMES = r"([A-Za-z_]\w*(?:\s*,\s*(?:[A-Za-z_]\w*|\.\.\.))*)"


def documented_shapes(block):
    """From a block's argument table: argument name -> True (array) or False (scalar), and
    argument name -> routine for the entries `p, n  as for solmpr`. An entry is
    `names  in|out|in/out|scratch  type ...`, one or several to a line (separated by ';')."""
    shapes, refs = {}, {}
    for line in block.split("\n"):
        line = re.sub(r"^\s*(/\*\*|\*(?!/))?", "", line)
        for k, entry in enumerate(line.split(";")):
            if k == 0 and not entry.startswith("  "):
                break  # prose, not a table line
            m = re.match(r"^\s*" + NAMES + r"\s+(in/out|inout|in|out|scratch|work)\s+(\S+)",
                         entry)
            if m:
                shaped = "(" in m.group(3) or m.group(3).rstrip(",") == "array"
                for name in re.split(r"\s*,\s*", m.group(1)):
                    shapes.setdefault(name, shaped)
                continue
            m = re.match(r"^\s*" + NAMES + r"\s+as for\s+([A-Za-z_]\w*)", entry)
            if m:
                for name in re.split(r"\s*,\s*", m.group(1)):
                    refs.setdefault(name, m.group(2))
    return shapes, refs


class Types:
    """The enum, record and callback types declared in any of the headers (a header may use
    a type that another one declares)."""

    def __init__(self):
        self.enum_types, self.struct_types, self.funptr_types = set(), set(), {}

    def scan(self, text):
        code = strip_comments(text)
        self.enum_types |= set(re.findall(r"\benum\s+([A-Za-z_]\w*)", code))
        for body in re.findall(r"typedef\s+enum[^;]*;", code, re.S):
            self.enum_types |= set(re.findall(r"}\s*([A-Za-z_]\w*)\s*;", body))
        self.struct_types |= set(re.findall(r"\bstruct\s+([A-Za-z_]\w*)", code))
        for m in re.finditer(r"typedef\s+([^;(]*?)\(\s*\*\s*([A-Za-z_]\w*)\s*\)\s*(\([^;]*\))\s*;",
                             code):
            self.funptr_types[m.group(2)] = " ".join(
                ("%s (*)%s" % (m.group(1).strip(), m.group(3))).split())


class Header:
    """The declarations and constants of one header."""

    def __init__(self, path, macros, types=None):
        with open(path, encoding="utf-8") as f:
            self.text = f.read()
        self.path = path
        self.macros = macros
        if types is None:
            types = Types()
            types.scan(self.text)
        self.enum_types = types.enum_types
        self.struct_types = types.struct_types
        self.funptr_types = types.funptr_types

    def parse(self):
        self.constants = self._constants()
        self.routines = self._routines()
        return self

    def _constants(self):
        out = []
        code = strip_comments(self.text)
        for m in re.finditer(r"^#define\s+(ORVQ7\w*)\s+\(?(-?\d+)\)?\s*$", code, re.M):
            out.append((m.group(1), int(m.group(2))))
        for body in re.findall(r"\benum\b[^{;]*\{([^}]*)\}", code):
            for m in re.finditer(r"\b(ORVQ7\w*)\s*=\s*(-?\d+)", body):
                out.append((m.group(1), int(m.group(2))))
        return out

    def _routines(self):
        lines = self.text.split("\n")
        marks = "|".join(re.escape(m) for m in self.macros) if self.macros else r"ORVQ7_\w*API"
        start = re.compile(r"^(?:%s)\s+(.*)$" % marks)
        routines = []
        block = ""         # the last /** ... */ block
        block_live = False  # no blank line or other code since that block (or its declarations)
        in_comment = False
        comment = []
        i = 0
        while i < len(lines):
            line = lines[i]
            if in_comment:
                comment.append(line)
                if "*/" in line:
                    in_comment = False
                    text = "\n".join(comment)
                    if text.lstrip().startswith("/**") and not text.lstrip().startswith("/**<"):
                        block, block_live = text, True
                i += 1
                continue
            stripped = line.strip()
            if stripped.startswith("/*") and "*/" not in stripped:
                in_comment, comment = True, [line]
                i += 1
                continue
            if stripped.startswith("/**") and not stripped.startswith("/**<"):
                block, block_live = stripped, True
                i += 1
                continue
            m = start.match(stripped)
            if m:
                decl = m.group(1)
                first = i
                while ";" not in strip_comments(decl):
                    i += 1
                    if i >= len(lines):
                        raise HeaderError("%s:%d: declaration without ';'" % (self.path, first + 1))
                    decl += " " + lines[i].strip()
                decl = strip_comments(decl)
                decl = " ".join(decl[:decl.index(";")].split())
                if not re.match(r"^extern\b", decl):
                    routines.append(self._routine(decl, block if block_live else "",
                                                  first + 1))
                i += 1
                continue
            block_live = False  # a blank line or other code ends the block's reach
            i += 1
        return routines

    def _routine(self, decl, block, lineno):
        where = "%s:%d" % (self.path, lineno)
        m = re.match(r"^(.*?)\b([A-Za-z_]\w*)\s*\((.*)\)$", decl)
        if not m:
            raise HeaderError("%s: cannot read the declaration '%s'" % (where, decl))
        ret, name, args_text = m.group(1).strip(), m.group(2), m.group(3).strip()
        shapes, refs = documented_shapes(block)
        brief = lead_sentence(block)
        args = []
        if args_text and args_text != "void":
            for k, arg in enumerate(split_args(args_text)):
                args.append(self._argument(arg, k + 1, shapes, refs, where))
        return {"name": name, "result": self._result(ret, where), "args": args,
                "brief": brief, "decl": decl}

    def _result(self, ret, where):
        base, stars, _ = base_type(ret)
        if stars == 0 and base == "void":
            return None
        if stars > 0:
            return "type(c_ptr)"
        if base in C_INT_TYPES:
            return C_INT_TYPES[base]
        if base in self.enum_types:
            return "integer(c_int)"
        raise HeaderError("%s: no Fortran type for the result '%s'" % (where, ret))

    def _argument(self, arg, position, shapes, refs, where):
        fp = re.match(r"^.*\(\s*\*\s*([A-Za-z_]\w*)?\s*\)\s*\(.*\)$", arg)
        if fp:
            return {"name": fp.group(1) or "a%d" % position, "decl": "type(c_funptr), value",
                    "c": arg}
        m = re.match(r"^(.*?)([A-Za-z_]\w*)\s*(\[[^\]]*\])?$", arg)
        if m and m.group(2) not in C_KEYWORDS and m.group(2) not in self.enum_types \
                and m.group(2) not in self.funptr_types and m.group(1).strip():
            type_text, name, brackets = m.group(1), m.group(2), m.group(3)
        else:
            type_text, name, brackets = arg, "a%d" % position, None
        base, stars, const_pointee = base_type(type_text)
        if brackets:
            stars += 1
        intent = "intent(in)" if const_pointee or stars == 0 else "intent(inout)"
        if base in self.funptr_types:
            proto = "%s = %s" % (base, self.funptr_types[base])
            if stars:
                return {"name": name, "decl": "type(c_funptr), " + intent, "c": proto}
            return {"name": name, "decl": "type(c_funptr), value", "c": proto}
        if base in self.enum_types:
            base = "int"
        if base in self.struct_types and stars == 1:
            # An opaque record of the library's own: its address, as from c_loc.
            return {"name": name, "decl": "type(c_ptr), value", "c": arg}
        if stars >= 2:
            return {"name": name, "decl": "type(c_ptr), " + intent, "c": arg}
        if base == "void":
            if stars == 1:
                return {"name": name, "decl": "type(c_ptr), value", "c": arg}
        elif base == "char":
            if stars == 1:
                return {"name": name, "decl": "character(kind=c_char), " + intent,
                        "dims": "(*)", "c": arg}
            return {"name": name, "decl": "character(kind=c_char), value", "c": arg}
        elif base in C_INT_TYPES:
            ftype = C_INT_TYPES[base]
            if stars == 0:
                return {"name": name, "decl": ftype + ", value", "c": arg}
            dims = "(*)" if shapes.get(name, False) else ""
            return {"name": name, "decl": "%s, %s" % (ftype, intent), "dims": dims, "c": arg,
                    "as_for": None if name in shapes else refs.get(name)}
        raise HeaderError("%s: no Fortran type for the argument '%s'" % (where, arg))


def lead_sentence(block):
    """The block's first sentence, or its first line when that runs on."""
    words = []
    for line in block.split("\n"):
        line = re.sub(r"^\s*(/\*\*|\*(?!/))?\s*", "", line)
        line = re.sub(r"\s*\*/\s*$", "", line)
        if not line or (words and line.startswith("  ")):
            break
        words += line.split()
        if line.endswith("."):
            break
    return " ".join(words)


def split_args(text):
    out, depth, cur = [], 0, ""
    for ch in text:
        if ch == "(":
            depth += 1
        elif ch == ")":
            depth -= 1
        if ch == "," and depth == 0:
            out.append(cur.strip())
            cur = ""
        else:
            cur += ch
    out.append(cur.strip())
    return out


def base_type(text):
    """(base type name, number of '*', whether the pointee is const)."""
    t = text.replace("*", " * ")
    words = t.split()
    stars = words.count("*")
    first_star = words.index("*") if "*" in words else len(words)
    const_pointee = stars > 0 and "const" in words[:first_star]
    names = [w for w in words if w not in ("*", "const", "volatile", "restrict", "struct",
                                           "enum")]
    if names[:2] == ["unsigned", "char"] or names[:2] == ["signed", "char"]:
        names = ["char"]
    if len(names) != 1:
        return " ".join(names), stars, const_pointee
    return names[0], stars, const_pointee


def fortran_name(name, taken):
    """A Fortran name for a C name: unique ignoring case within one scope."""
    base = name if re.match(r"^[A-Za-z]", name) else "x" + name
    candidate = base
    k = 1
    while candidate.lower() in taken:
        candidate = "%s_%d" % (base, k)
        k += 1
    taken.add(candidate.lower())
    return candidate


def wrap(prefix, items, suffix, indent, sep=", ", cont=None):
    """One Fortran statement, continued with '&' so no line passes MAX_LINE (or, with
    cont, a comment continued on lines that start with cont)."""
    lines = []
    cur = prefix
    for k, item in enumerate(items):
        piece = item + (sep if k < len(items) - 1 else "")
        if len(cur) + len(piece) + 2 > MAX_LINE:
            if cont is not None:
                lines.append(cur.rstrip())
                cur = cont + piece
                continue
            lines.append(cur.rstrip() + " &")
            cur = " " * (indent + 4) + piece
        else:
            cur += piece
    if len(cur) + len(suffix) + 2 > MAX_LINE:
        lines.append(cur.rstrip() + " &")
        cur = " " * (indent + 4) + suffix.lstrip()
    else:
        cur += suffix
    lines.append(cur)
    return lines


def resolve_references(headers):
    """Gives an argument documented `as for <routine>` that routine's shape for it."""
    by_name = {r["name"]: r for h in headers for r in h.routines}
    for h in headers:
        for r in h.routines:
            for a in r["args"]:
                other = by_name.get(a.get("as_for") or "")
                if other is None:
                    continue
                for b in other["args"]:
                    if b["name"] == a["name"] and b["decl"] == a["decl"] and "dims" in b:
                        a["dims"] = b["dims"]


def emit(module, headers):
    out = ["! %s.f90 -- Fortran interfaces to the routines of the C headers listed below." % module,
           "! Generated at build time from the headers; do not edit: edit the headers.",
           "! Every argument is passed by reference unless declared 'value'; arrays are",
           "! assumed-size and column-major, as in C. A routine argument is passed as",
           "! c_funloc(proc), proc a bind(C) procedure with the C prototype quoted above it."]
    for h in headers:
        out.append("!   " + h.path)
    out += ["module %s" % module,
            "  use, intrinsic :: iso_c_binding, only: %s, &" % ", ".join(C_KINDS[:5]),
            "                                        %s" % ", ".join(C_KINDS[5:]),
            "  implicit none", ""]
    resolve_references(headers)
    taken = set(C_KINDS) | {module.lower()}
    seen_constants = set()
    for h in headers:
        for name, value in h.constants:
            if name in seen_constants:
                continue
            seen_constants.add(name)
            fname = fortran_name(name, taken)
            if fname != name:
                raise HeaderError("constant %s clashes with another name" % name)
            out.append("  integer(c_int), parameter :: %s = %d" % (name, value))
    out += ["", "  interface"]
    routine_names = set()
    for h in headers:
        for r in h.routines:
            if r["name"] in routine_names:
                continue
            routine_names.add(r["name"])
            if r["name"].lower() in taken:
                raise HeaderError("routine %s clashes (ignoring case) with another name"
                                  % r["name"])
            taken.add(r["name"].lower())
            out += interface(r)
    out += ["  end interface", "", "end module %s" % module, ""]
    return "\n".join(out)


def interface(r):
    fname = r["name"]
    local = {fname.lower()}
    argnames = [fortran_name(a["name"], local) for a in r["args"]]
    kind = "function" if r["result"] else "subroutine"
    out = [""]
    if r["brief"]:
        out += wrap("    ! ", r["brief"].split(" "), "", 4, sep=" ", cont="    ! ")
    for a in r["args"]:
        if a["decl"].startswith("type(c_funptr)"):
            out += wrap("    ! %s: " % a["name"], a["c"].split(" "), "", 4, sep=" ",
                        cont="    !   ")
    out += wrap("    %s %s(" % (kind, fname), argnames,
                ') bind(C, name="%s")' % r["name"], 4)
    kinds = set()
    for a in r["args"]:
        kinds |= set(re.findall(r"\bc_\w+", a["decl"]))
    if r["result"]:
        kinds |= set(re.findall(r"\bc_\w+", r["result"]))
    kinds = sorted(kinds)
    if kinds:
        out.append("      import :: " + ", ".join(kinds))
    for a, n in zip(r["args"], argnames):
        out.append("      %s :: %s%s" % (a["decl"], n, a.get("dims", "")))
    if r["result"]:
        out.append("      %s :: %s" % (r["result"], fname))
    out.append("    end %s %s" % (kind, fname))
    return out


def main(argv):
    p = argparse.ArgumentParser(description=__doc__.split("\n")[0])
    p.add_argument("--module", required=True)
    p.add_argument("--output", required=True)
    p.add_argument("--macro", action="append", default=[])
    p.add_argument("headers", nargs="+")
    args = p.parse_args(argv)
    try:
        types = Types()
        headers = [Header(h, args.macro, types) for h in args.headers]
        for h in headers:
            types.scan(h.text)
        for h in headers:
            h.parse()
        text = emit(args.module, headers)
    except HeaderError as e:
        print("gen_fortran.py: " + str(e), file=sys.stderr)
        return 1
    try:
        with open(args.output, encoding="utf-8") as f:
            if f.read() == text:
                return 0  # unchanged: keep the timestamp, nothing recompiles
    except OSError:
        pass
    with open(args.output, "w", encoding="utf-8") as f:
        f.write(text)
    return 0


if __name__ == "__main__":
    sys.exit(main(sys.argv[1:]))
