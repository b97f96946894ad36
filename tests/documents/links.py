#!/usr/bin/env python3
"""links.py SOURCES: every relative link of the Markdown documents leads to something, and docs/README.md to each
document.

A link to a place on a page wants a heading that is called so.
"""

import pathlib
import re
import sys

SKIPPED = {"build", "out", ".git"}


def documents_of(root):
    for path in sorted(root.rglob("*.md")):
        if not SKIPPED.intersection(path.relative_to(root).parts):
            yield path


def without_code(text):
    """Neither blocks nor words in code are links."""
    return re.sub(r"`[^`\n]*`", "`code`", re.sub(r"^( *)```.*?^\1```", "", text, flags=re.MULTILINE | re.DOTALL))


def links_of(path):
    for match in re.finditer(r"\[[^\]]*\]\(([^)\s]+)\)", without_code(path.read_text())):
        yield match.group(1)


def anchors_of(path):
    text = re.sub(r"^```.*?^```", "", path.read_text(), flags=re.MULTILINE | re.DOTALL)
    for heading in re.findall(r"^#+ +(.+)$", text, re.MULTILINE):
        kept = re.sub(r"[^\w\- ]", "", heading.lower())
        yield kept.replace(" ", "-")


def problem(document, link):
    """What is wrong with it, or nothing."""
    if re.match(r"[a-z]+:", link):
        return ""
    name, _, anchor = link.partition("#")
    target = document if not name else (document.parent / name).resolve()
    if not target.exists():
        return "leads nowhere"
    if anchor and anchor not in anchors_of(target):
        return "leads to a heading that is not there"
    return ""


def main():
    root = pathlib.Path(sys.argv[1]).resolve()
    failures = []
    count = 0
    for document in documents_of(root):
        for link in links_of(document):
            count += 1
            wrong = problem(document, link)
            if wrong:
                failures.append(f"{document.relative_to(root)}: {link} {wrong}")
    index = root / "docs" / "README.md"
    named = {(index.parent / link.partition("#")[0]).resolve() for link in links_of(index)}
    for document in sorted((root / "docs").rglob("*.md")):
        if document != index and document not in named:
            failures.append(f"docs/README.md does not name {document.relative_to(root)}")
    if not count:
        failures.append("there is no link at all")
    if failures:
        sys.exit("\n".join(failures))
    print(f"{count} links")


main()
