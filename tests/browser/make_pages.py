"""make_pages.py SCHEMA-MIGRATE EXAMPLES FOLDER: writes the pages that the tests look at, and the
JSON documents of the same runs, into the folder, which is made anew."""

import os
import shutil
import subprocess
import sys

TOOL, EXAMPLES, FOLDER = sys.argv[1:4]

HOSTILE = [
    "</script><script>document.title = &quot;hurt&quot;; alert(1)</script>",
    "</style></title><img src=x onerror=alert(1)>",
    "<svg onload=alert(1)>",
    "<iframe src=javascript:alert(1)>",
    "<a href=javascript:alert(1)>here</a>",
    "<base href=https://example.invalid/><link rel=stylesheet href=https://example.invalid/a.css>",
    "<meta http-equiv=refresh content=0;url=https://example.invalid/>",
    "{{SCRIPT}} {{#DEFINITION}} ${alert(1)} {{=<% %>=}}",
    "<!-- <script> -->",
    '" onfocus="alert(1)" autofocus="',
]


def write(folder, files):
    os.makedirs(folder)
    for name, text in files.items():
        with open(os.path.join(folder, name), "wb") as file:
            file.write(text if isinstance(text, bytes) else text.encode())


def run(name, arguments, codes):
    """One run that writes the page, and prints the document."""
    page = os.path.join(FOLDER, name + ".html")
    result = subprocess.run(
        [TOOL, *arguments, "--format", "json", "--html", page],
        stdout=subprocess.PIPE, stderr=subprocess.PIPE, check=False)
    if result.returncode not in codes:
        sys.exit(f"{arguments} ended with {result.returncode}: {result.stderr.decode()}")
    with open(os.path.join(FOLDER, name + ".json"), "wb") as file:
        file.write(result.stdout)


def sides(folder, with_base=True):
    base = ["--base", os.path.join(folder, "base")] if with_base else []
    return [*base, "--from", os.path.join(folder, "old"), "--to", os.path.join(folder, "new")]


def type_of(number, name, rest):
    return f"attributetypes=( 1.3.6.1.4.1.32473.1.{number} NAME '{name}' {rest} " \
           "USAGE userApplications )\n"


def hostile_installations(folder):
    """Texts in quotes are printable ASCII for the reader; other bytes stand in comments."""
    for side, end in (("base", ""), ("old", " ours"), ("new", " theirs")):
        types = "".join(
            type_of(i, f"hostile{i}", f"DESC '{text.replace(chr(39), '')}{end}' "
                    f"EQUALITY {'caseIgnoreMatch' if side == 'base' else side + 'Match'}")
            for i, text in enumerate(HOSTILE))
        comment = b"# \xff\x1b[31m \xe2\x80\xa8 </script><img src=x onerror=alert(1)>\n"
        write(os.path.join(folder, side), {
            "V3.user.at": types.encode() + comment,
            "V3.user.oc": "objectclasses=( 1.3.6.1.4.1.32473.2.1 NAME '<b>class' SUP "
                          "<script>alert(1)</script> STRUCTURAL MAY ( <img$onerror ) )\n",
            "V3.<img src=x onerror=alert(1)>": "",
        })


def large_installations(folder, number):
    """Each definition was changed by the site or the release, or both."""
    types = number * 4 // 5
    for side in ("base", "old", "new"):
        lines = []
        for i in range(types):
            text = "shipped"
            if side == "old" and i % 3 == 0:
                text = "ours"
            elif side == "new":
                text = "shipped anew" if i % 3 == 1 else "better"
            superior = f"SUP attr{i - i % 50} " if i % 50 else ""
            single = " SINGLE-VALUE" if side == "old" and i % 7 == 0 else ""
            lines.append(type_of(i, f"attr{i}", f"DESC 'Text of {i}, {text}' {superior}EQUALITY "
                                 f"caseIgnoreMatch SYNTAX 1.3.6.1.4.1.1466.115.121.1.15{single}"))
        classes = []
        for i in range(number - types):
            members = [f"attr{(i * 7 + k) % types}" for k in range(12)]
            if side != "base":
                members.append(f"attr{(i * 7 + (20 if side == 'old' else 21)) % types}")
            superior = f"class{i - i % 20}" if i % 20 else "top"
            classes.append(f"objectclasses=( 1.3.6.1.4.1.32473.2.{i} NAME 'class{i}' SUP "
                           f"{superior} STRUCTURAL MAY ( {' $ '.join(members)} ) )\n")
        write(os.path.join(folder, side),
              {"V3.user.at": "".join(lines), "V3.user.oc": "".join(classes)})


def fleet(examples):
    """Plans of five installations of one release, customised differently, saved beside the pages."""
    plans = []
    for name, changes, options in (
            ("oslo", [], []),
            ("bergen", [("8192", "9000")], []),
            ("narvik", [("320", "384")], []),
            ("bodo", [], ["--decisions", os.path.join(examples, "decisions.toml")]),
            ("hamar", None, ["--accept-base"])):
        folder = os.path.join(FOLDER, "fleet-installations", name)
        shutil.copytree(os.path.join(examples, "base" if changes is None else "old"), folder)
        for file in os.listdir(folder):
            path = os.path.join(folder, file)
            with open(path, encoding="utf-8") as text:
                changed = text.read()
            for old, new in changes or []:
                changed = changed.replace(old, new)
            with open(path, "w", encoding="utf-8") as text:
                text.write(changed)
        plans.append(os.path.join(FOLDER, name + "-plan.json"))
        save(["--base", os.path.join(examples, "base"), "--from", folder,
              "--to", os.path.join(examples, "new"), *options], plans[-1])
    return plans


def save(arguments, path):
    subprocess.run([TOOL, "plan", *arguments, "--save", path], stdout=subprocess.DEVNULL,
                   stderr=subprocess.DEVNULL, check=False)


shutil.rmtree(FOLDER, ignore_errors=True)
os.makedirs(FOLDER)
run("plan", ["plan", *sides(EXAMPLES)], (4,))
run("unknown", ["plan", *sides(EXAMPLES, with_base=False)], (4,))
run("diff", ["diff", *sides(EXAMPLES)], (1,))
run("migrate", ["migrate", *sides(EXAMPLES), "--decisions", os.path.join(EXAMPLES, "decisions.toml"),
                "--dry-run", "--out", os.path.join(FOLDER, "out")], (0,))
run("check", ["check", os.path.join(EXAMPLES, "old"), os.path.join(EXAMPLES, "new")], (0, 1))

HOSTILE_FOLDER = os.path.join(FOLDER, "<img src=x onerror=alert(1)>")
hostile_installations(HOSTILE_FOLDER)
run("hostile", ["diff", *sides(HOSTILE_FOLDER)], (1,))
run("hostile-check", ["check", os.path.join(HOSTILE_FOLDER, "old")], (1,))
HOSTILE_PLAN = os.path.join(FOLDER, "hostile-plan.json")
save(sides(HOSTILE_FOLDER), HOSTILE_PLAN)
run("hostile-fleet", ["fleet", "<script>alert(2)<img>=" + HOSTILE_PLAN], (4,))
run("fleet", ["fleet", *fleet(EXAMPLES)], (4,))

LARGE_FOLDER = os.path.join(FOLDER, "large-installations")
large_installations(LARGE_FOLDER, 10000)
run("large", ["diff", *sides(LARGE_FOLDER)], (1,))
