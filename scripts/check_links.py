#!/usr/bin/env python3
"""Checks the links inside the project: of each Markdown page, and within the reference. Checks that the files that pages
name in `code` exist.

Usage: check_links.py HTML_FOLDER       prints each dead link and missing file
"""
import pathlib
import re
import sys
import urllib.parse

NAMED_FILE = re.compile(r"`((?:bench|cmake|docs|fuzz|include|scripts|src|tests)/[\w/.]*)`")
ELSEWHERE = re.compile(r"^(https?:|mailto:|javascript:|#|@ref )")


def targets_of_markdown(text):
    """The targets of a page's links, outside code blocks."""
    text = re.sub(r"^```.*?^```", "", text, flags=re.S | re.M)
    text = re.sub(r"`[^`\n]*`", "", text)
    return re.findall(r"\]\(([^)\s]+)\)", text)


def targets_of_html(text):
    return re.findall(r'(?:href|src)="([^"]+)"', text)


def dead_links(pages, targets_of):
    for page in pages:
        for target in targets_of(page.read_text("utf-8", "replace")):
            path = urllib.parse.unquote(target.partition("#")[0].replace("&amp;", "&"))
            if not ELSEWHERE.match(target) and not (page.parent / path).exists():
                yield f"{page}: dead link: {target}"


def main():
    if len(sys.argv) != 2 or sys.argv[1] in ("-h", "--help"):
        sys.exit(__doc__)
    root = pathlib.Path(__file__).resolve().parent.parent
    pages = [page for pattern in ("*.md", "*/*.md", "*/*/*.md") for page in sorted(root.glob(pattern))
             if page.relative_to(root).parts[0] != "build"]
    html = sorted(pathlib.Path(sys.argv[1]).glob("**/*.html"))
    errors = [*dead_links(pages, targets_of_markdown), *dead_links(html, targets_of_html)]
    errors += [f"{page}: no such file: {name}" for page in pages for name in NAMED_FILE.findall(page.read_text("utf-8"))
               if not (root / name).exists()]
    if not html:
        errors.append(f"{sys.argv[1]}: no reference there")
    sys.exit("\n".join(errors) if errors else 0)


if __name__ == "__main__":
    main()
