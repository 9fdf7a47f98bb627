#!/usr/bin/env python3
"""Makes links of the names of functions and classes in the code of the reference's pages.

Usage: link_names.py HTML_FOLDER TAG_FILE       rewrites the pages made from Markdown
"""
import pathlib
import re
import sys
import xml.etree.ElementTree

NAME = re.compile(r"(?<![\w.:/&;-])[A-Za-z_]\w+(?:::\w+)*(?![\w/])")
CODE = re.compile(r"<code>([^<]*)</code>")
NOT_TEXT = re.compile(r'(<div class="fragment">.*?<!-- fragment -->|<pre .*?</pre>|<a .*?</a>)', re.S)
DISTINCT = re.compile(r"[A-Z_]|::")  # an English word is a name only where its family or class is the subject


def names_of(tag_file):
    """Of each name, qualified or not, the places: (address, family, class)."""
    compounds = xml.etree.ElementTree.parse(tag_file).getroot()
    family = {}  # of a header's page and of a class
    for file in compounds.iterfind("compound[@kind='file']"):
        header = (file.findtext("path") + file.findtext("name")).rpartition("include/basalt/")[2]
        for owned in (file.findtext("filename"), *(item.text for item in file.iterfind("class"))):
            family[owned] = re.match("[a-z]+", header)[0]
    names = {}

    def add(parts, place):
        for at in range(len(parts)):
            places = names.setdefault("::".join(parts[at:]), [])
            if all(place[1:] != other[1:] for other in places):  # the first of several overloads
                places.append(place)

    for compound in compounds:
        name, page, kind = (compound.findtext(key) or compound.get(key) for key in ("name", "filename", "kind"))
        is_class = kind in ("class", "struct")
        own = name.split("::") if is_class else []
        of = family.get(name if is_class else page, "")
        if is_class:
            add(own, (page, of, ""))
        for member in compound.iterfind("member") if is_class or kind == "file" else ():
            called, anchor = member.findtext("name"), member.findtext("anchor")
            if anchor and called not in own and (not is_class or member.get("kind") == "function"):
                add([*own, called], (f"{member.findtext('anchorfile')}#{anchor}", of, own[-1] if own else ""))
    return names


def address_of(name, names, family, subjects):
    """Where a name leads to; None for a word that is no name, and where several may be meant."""
    places = names.get(name) or names.get(name.removeprefix("basalt::"), [])
    for chosen in (*([place for place in places if place[2] == subject] for subject in reversed(subjects)),
                   [place for place in places if place[1] == family],
                   places if DISTINCT.search(name) else []):
        free = [place for place in chosen if place[2] == ""]
        if len(chosen) == 1 or len(free) == 1:
            return (free or chosen)[0][0]
    return None


def linked(text, names, family):
    subjects = []  # the classes named so far

    def link(match):
        address = address_of(match[0], names, family, subjects)
        if address and address.startswith(("class", "struct")) and "#" not in address:
            subjects.append(match[0].rpartition("::")[2])
        return f'<a class="el" href="{address}">{match[0]}</a>' if address else match[0]

    pieces = NOT_TEXT.split(text)
    for at in range(0, len(pieces), 2):
        pieces[at] = CODE.sub(lambda code: f"<code>{NAME.sub(link, code[1])}</code>", pieces[at])
    return "".join(pieces)


def main():
    if len(sys.argv) != 3 or sys.argv[1] in ("-h", "--help"):
        sys.exit(__doc__)
    names = names_of(sys.argv[2])
    for page in sorted(pathlib.Path(sys.argv[1]).glob("*.html")):
        if page.name == "index.html" or page.name.startswith("md_") and "bindings" not in page.name:
            family = page.stem.removeprefix("md_docs_")
            page.write_text(linked(page.read_text("utf-8"), names, family), "utf-8")


if __name__ == "__main__":
    main()
