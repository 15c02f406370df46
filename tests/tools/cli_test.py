#!/usr/bin/env python3
"""tests/tools/cli_test.py TOOL CASE -- drives the orvq7 program and checks what it prints and
writes: subcommands on answers known in closed form, one-line errors with a non-zero exit on
bad input, and the gallery's files (SVG well-formed, CSV read back)."""
import csv
import json
import math
import os
import re
import subprocess
import sys
import tempfile
import xml.etree.ElementTree as ET

TOOL = os.path.abspath(sys.argv[1])
SVG = "{http://www.w3.org/2000/svg}"


def run(*args, cwd=None, code=0):
    p = subprocess.run([TOOL, *args], capture_output=True, text=True, cwd=cwd, timeout=600)
    assert p.returncode >= 0, f"{args}: killed by signal {-p.returncode}\n{p.stderr}"
    assert p.returncode == code, f"{args}: exit {p.returncode}, expected {code}\n{p.stdout}{p.stderr}"
    return p


def refused(args, words, code=2):
    """A bad input: exit `code`, one line on standard error that names the problem."""
    p = run(*args, code=code)
    lines = p.stderr.splitlines()
    assert len(lines) == 1, f"{args}: {len(lines)} lines on stderr:\n{p.stderr}"
    for w in words:
        assert w in lines[0], f"{args}: '{w}' not in '{lines[0]}'"
    return lines[0]


def numbers(text):
    return [float(v) for v in re.findall(r"[-+]?\d+(?:\.\d*)?(?:e[-+]?\d+)?", text)]


def roots_of(stdout):
    """The roots printed, as complex numbers."""
    out = []
    for line in stdout.splitlines():
        m = re.match(r"root \d+\s+(\S+)(?: ([+-]) (\S+) i)?\s+\|p", line)
        if m:
            im = float(m.group(3)) * (-1 if m.group(2) == "-" else 1) if m.group(2) else 0.0
            out.append(complex(float(m.group(1)), im))
    return out


def same_roots(got, want, tol=1e-12):
    assert len(got) == len(want), f"{got} vs {want}"
    rest = list(got)
    for w in want:
        best = min(rest, key=lambda g: abs(g - w))
        assert abs(best - w) <= tol * max(1, abs(w)), f"{w} missing from {got}"
        rest.remove(best)


def read_points(path):
    with open(path, newline="") as f:
        rows = list(csv.reader(f))
    header, data = rows[0], [[float(v) for v in r] for r in rows[1:]]
    assert header[:2] == ["point", "phase"], header
    assert all(len(r) == len(header) for r in data), "ragged CSV"
    assert [r[0] for r in data] == list(range(1, len(data) + 1)), "points not numbered 1.."
    n = (len(header) - 2) // 2
    return header, [r[2:2 + n] for r in data], [r[2 + n:] for r in data]


def check_svg(path, words=()):
    root = ET.parse(path).getroot()  # raises on a document that is not well-formed
    assert root.tag == SVG + "svg", root.tag
    lines = root.findall(f".//{SVG}polyline")
    assert lines and len(lines[0].get("points").split()) >= 2, f"{path}: no path drawn"
    assert root.findall(f"{SVG}rect"), f"{path}: no box"
    text = " ".join(t.text or "" for t in root.iter(SVG + "text"))
    for w in ("start", *words):
        assert w in text, f"{path}: '{w}' not in the picture's text"


# ---- Cases ----

def case_roots():
    # (x - 1)(x - 2)(x - 3), (x^2 - 1)(x^2 - 9), x^2 + 2x + 5, x^4 + 1, by several solvers.
    same_roots(roots_of(run("roots", "1", "-6", "11", "-6").stdout), [1, 2, 3])
    same_roots(roots_of(run("roots", "--solver", "ferari", "1", "0", "-10", "0", "9").stdout),
               [1, -1, 3, -3])
    same_roots(roots_of(run("roots", "--solver", "duos", "1", "2", "5").stdout),
               [-1 + 2j, -1 - 2j])
    h = math.sqrt(0.5)
    same_roots(roots_of(run("roots", "--solver", "quadr", "1", "0", "0", "0", "1").stdout),
               [h + h * 1j, h - h * 1j, -h + h * 1j, -h - h * 1j], 1e-15)
    out = run("roots", "--solver", "duos", "0", "0", "3").stdout
    assert "flag 1" in out and "no solution" in out and not roots_of(out), out
    refused(["roots", "1", "2", "3", "4", "5", "6"], ["degree 5", "out of range"])
    refused(["roots", "1", "two"], ["'two' is not a number"])
    refused(["roots", "--solver", "cardan", "1", "2"], ["cardan takes 4 coefficients"])
    refused(["roots", "--solver", "newton", "1", "2"], ["unknown solver 'newton'"])
    refused(["roots"], ["coefficients is required"])


def case_fit():
    with tempfile.TemporaryDirectory() as d:
        # Points on the plane 2x - y + 2z = 3: unit normal (2, -1, 2) / 3, d = -1.
        pts = [(x, y, (3 - 2 * x + y) / 2) for x in (-1.5, 0.25, 2) for y in (-1, 0.5, 3)]
        good = os.path.join(d, "plane.csv")
        with open(good, "w") as f:
            f.write("# a plane\nz,x,y\n" + "".join(f"{z!r},{x!r},{y!r}\n" for x, y, z in pts))
        out = run("fit", good).stdout
        plane = re.search(r"mean plane\s+(.*) = 0", out).group(1)
        a, b, c, dd = numbers(plane.replace(" - ", " -").replace(" + ", " +"))
        s = 1 if a > 0 else -1
        for got, want in zip((a, b, c, dd), (2 / 3, -1 / 3, 2 / 3, -1)):
            assert abs(s * got - want) < 1e-9, out
        assert numbers(re.search(r"half-thickness (\S+)", out).group(1))[0] < 1e-12, out
        bad = os.path.join(d, "bad.csv")
        with open(bad, "w") as f:
            f.write("x,y,z\n1,2,3\n4,5,six\n")
        refused(["fit", bad], ["bad.csv:3", "'six' is not a number"])
        with open(bad, "w") as f:
            f.write("1,2,3\n4,5\n")
        refused(["fit", bad], ["bad.csv:2", "2 fields, expected 3"])
        with open(bad, "w") as f:
            f.write("1,2\n4,5\n")
        refused(["fit", bad], ["2 columns"])
        refused(["fit", os.path.join(d, "missing.csv")], ["cannot open"])


def case_closest():
    # Segment (0,0,0)-(2,0,0) and segment (1,-1,1)-(1,1,1): closest at their midpoints, 1 apart.
    out = run("closest", "--seg1", "0,0,0", "2,0,0", "--seg2", "1,-1,1", "1,1,1").stdout
    assert abs(numbers(re.search(r"t1 (.*)point", out).group(1))[0] - 0.5) < 1e-15, out
    assert abs(numbers(re.search(r"t2 (.*)point", out).group(1))[0] - 0.5) < 1e-15, out
    assert abs(numbers(re.search(r"distance (.*)", out).group(1))[0] - 1) < 1e-15, out
    # Segment (0,0,0,0)-(4,0,0,0) and the line through (1,2,0,0) along (0,0,3,0) (made unit):
    # closest at t = 1/4, s = 0, distance 2.
    out = run("closest", "--seg1", "0,0,0,0", "4,0,0,0", "--line", "0,0,3,0", "1,2,0,0").stdout
    assert abs(numbers(re.search(r"\bt (.*)point", out).group(1))[0] - 0.25) < 1e-15, out
    assert abs(numbers(re.search(r"distance (.*)", out).group(1))[0] - 2) < 1e-15, out
    refused(["closest", "--seg1", "0,0", "1,1,1", "--seg2", "0,0,0", "1,1,1"],
            ["first segment", "2 and 3 coordinates"])
    refused(["closest", "--seg1", "0,0", "1,1", "--line", "0,0", "1,1"], ["direction is zero"])
    refused(["closest", "--seg1", "0,0", "1,1"], ["--seg2 or --line"])


def case_trace():
    with tempfile.TemporaryDirectory() as d:
        # The unit circle from (1, 0) upwards closes on its start; every point is on it.
        out = run("trace", "-e", "x^2 + y^2 = 1", "--start", "1,0", "--dir", "0,1",
                  "--box=-2:2", "--out", d, "--name", "circle").stdout
        assert "closed on its start point" in out, out
        header, pts, tangents = read_points(os.path.join(d, "circle.csv"))
        assert header == ["point", "phase", "x", "y", "t_x", "t_y"], header
        assert pts[0] == [1.0, 0.0] and pts[-1] == pts[0], (pts[0], pts[-1])
        assert len(pts) > 20
        assert all(abs(x * x + y * y - 1) < 1e-5 for x, y in pts)
        assert all(abs(math.hypot(*t) - 1) < 1e-9 for t in tangents[1:])
        length = numbers(re.search(r"length (\S+)", out).group(1))[0]
        assert abs(length - 2 * math.pi) < 0.01, length  # a polygon inscribed in the circle
        check_svg(os.path.join(d, "circle.svg"), ["closed"])
        # The line y = x / 2 from the origin leaves [-1, 1]^2 through x = 1, at (1, 1/2).
        out = run("trace", "-e", "y - x/2", "--start", "0,0", "--dir", "1,0.5",
                  "--box=-1:1", "--kind", "2", "--json", "--out", d, "--name", "line").stdout
        assert "left the box through the face x = 1 (upper bound of x)" in out, out
        data = json.load(open(os.path.join(d, "line.json")))
        assert data["ending"]["kind"] == "left_box"
        assert data["ending"]["face"] == {"unknown": "x", "bound": "upper"}
        end = data["points"][-1]["x"]
        assert end[0] == 1.0 and abs(end[1] - 0.5) < 1e-12, end
        check_svg(os.path.join(d, "line.svg"), ["left through x = 1"])
        # Three unknowns, default names, default direction (the tangent), pictured on (x, z).
        out = run("trace", "-e", "x^2 + y^2 - 1", "-e", "z - y", "--start", "0,1,1",
                  "--box=-1.5:1.5", "--axes", "x,z", "--out", d, "--name", "tilted").stdout
        assert "closed on its start point" in out, out
        check_svg(os.path.join(d, "tilted.svg"), ["projection on (x, z)"])


def case_errors():
    base = ["trace", "--box=-2:2", "--out", tempfile.gettempdir()]
    refused([*base, "-e", "x^2 + y^2 -", "--start", "1,0"], ["equation 1", "Unexpected end"])
    refused([*base, "-e", "x^2 + w", "--start", "1,0"], ["equation 1", '"w"'])
    refused([*base, "-e", "x^2 + y^2 - 1", "--start", "1,0.5"],
            ["start point is off the curve", "0.0625"])
    refused([*base, "-e", "x^2 + y^2 - 1", "--start", "1,0,0"], ["start point", "3 values"])
    refused([*base, "-e", "x^2 + y^2 - 1", "--start", "3,0"], ["outside its box range"])
    refused([*base, "-e", "x - 2", "--start", "2,0", "--dir", "1,0"], ["leaves the box at once"])
    refused(["trace", "-e", "x+y", "--start", "0,0", "--box=1:-1"], ["'1:-1' has lo >= hi"])
    refused([*base, "-e", "x+y", "--start", "0,0", "--kind", "3"], ["--kind"])
    refused([*base, "-e", "x+y", "--start", "0,0", "--step", "0.1:0.01"], ["lo >= hi"])
    refused([*base, "-e", "x+y", "--start", "0,0", "--step", "0:0.01"], ["0 < minimum < maximum"])
    refused([*base, "-e", "x+y", "--start", "0,0", "--axes", "x,q"], ["axes", "'q'"])
    refused([*base, "-e", "x+y"], ["--start is required"])
    refused(["frobnicate"], ["frobnicate"])
    # The solver's own failure: a point limit of the evaluations, reported with exit 1.
    line = refused([*base, "-e", "x^2 + y^2 - 1", "--start", "1,0", "--max-calls", "5"],
                   ["the path failed with code", "stopped after 5 calls"], code=1)
    assert line.startswith("orvq7 trace:"), line


def case_progress():
    with tempfile.TemporaryDirectory() as d:
        p = run("trace", "-e", "x^2 + y^2 = 1", "--start", "1,0", "--box=-2:2", "--progress",
                "0", "--out", d)
        assert re.search(r"tracing trace: \d+ evaluations, [\d.]+ s, at x = ", p.stderr), p.stderr
        p = run("trace", "-e", "x^2 + y^2 = 1", "--start", "1,0", "--box=-2:2", "--quiet",
                "--progress", "0", "--out", d)
        assert p.stderr == "", p.stderr


def case_gallery():
    # The main job: no arguments at all, in a fresh folder.
    with tempfile.TemporaryDirectory() as d:
        out = run(cwd=d).stdout
        folder = os.path.join(d, "orvq7-gallery")
        assert "writing into orvq7-gallery" in out, out
        assert "Every item succeeded." in out, out
        assert open(os.path.join(folder, "summary.txt")).read() in out
        endings = {"circle": "closed", "viviani": "closed", "folium": "left through",
                   "lissajous5": "closed"}
        for name, word in endings.items():
            check_svg(os.path.join(folder, name + ".svg"), [word])
            header, pts, _ = read_points(os.path.join(folder, name + ".csv"))
            assert len(pts) > 10, name
            if word == "closed":
                assert pts[-1] == pts[0], name
        assert "left the box through the face x = -3" in out, out


CASES = {name[5:]: f for name, f in globals().items() if name.startswith("case_")}

if __name__ == "__main__":
    CASES[sys.argv[2]]()
    print(f"{sys.argv[2]}: passed")
