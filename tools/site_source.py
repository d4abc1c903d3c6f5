#!/usr/bin/env python3
"""Writes the sources of the site, in Markdown: site_source.py REFERENCE.json FOLDER

REFERENCE.json is what `talutil reference --json` prints. Each member has a page; families, classes and the names of all
members have lists of these. The pages of docs and the texts at the top of the checkout are copied, except that links
are mended: those to the reference lead to its pages, those to other files of the checkout become their names.
"""
import json
import os
import posixpath
import re
import shutil
import sys

TOP = os.path.join(os.path.dirname(os.path.abspath(__file__)), "..")

# The pages of docs in the order of the site; the others follow under "Background".
GUIDES = ["troubleshooting", "behaviour", "batch", "command", "dates", "windows", "drawing", "name-case", "clients",
          "cipher-text"]
TOP_PAGES = {"README.md": "index.md", "CHANGELOG.md": "changelog.md", "CONTRIBUTING.md": "contributing.md"}
ERRORS = {5: "Invalid procedure call or argument", 6: "Overflow", 7: "Out of memory", 9: "Subscript out of range",
          11: "Division by zero", 13: "Type mismatch", 53: "File not found", 61: "Disk full", 70: "Permission denied",
          75: "Path/File access error", 76: "Path not found", 91: "Object variable or With block variable not set",
          94: "Invalid use of Null", 424: "Object required", 438: "Object doesn't support this property or method",
          445: "Object doesn't support this action"}


def plain(text):
    return re.sub(r"([|*_<`\\\[\]$])", r"\\\1", text)


class Site:
    def __init__(self, reference, folder):
        self.classes, self.families, self.folder = reference["classes"], reference["families"], folder
        self.pages = {}  # The full name of a member or class: its page.
        for owner in self.classes:
            self.pages[owner["name"]] = f"reference/{owner['name']}.md"
            for member in owner["members"]:
                self.pages[self.full_name(owner, member)] = f"reference/{owner['name']}/{member['name']}.md"
        self.anchors = {name.replace(".", "").lower(): page for name, page in self.pages.items()}

    def full_name(self, owner, member):
        return member["name"] if owner is self.classes[0] else f"{owner['name']}.{member['name']}"

    def write(self, page, text):
        path = os.path.join(self.folder, page)
        os.makedirs(os.path.dirname(path), exist_ok=True)
        with open(path, "w", encoding="utf-8") as output:
            output.write(text)

    def link(self, name, page):
        """A link on a page to a member, a class or a page of docs."""
        target = self.pages.get(name, name)
        shown = f"`{name}`" if name in self.pages else name.removeprefix("docs/")
        return f"[{shown}]({posixpath.relpath(target, posixpath.dirname(page))})"

    def family_page(self, owner, family):
        if owner is not self.classes[0]:
            return self.pages[owner["name"]]
        return f"reference/{family.replace(' ', '-')}.md"

    # ---- The pages of members

    def arguments(self, member):
        if not member["parameters"]:
            return ""
        rows = ["## Arguments", ""]
        for parameter in member["parameters"]:
            kind = parameter["type"] + (", written back" if parameter["written_back"] else "")
            if parameter["optional"]:
                kind += f", `{parameter['default']}` when left out"
            meaning = parameter["text"].removesuffix(" Written back.")
            rows += [f"`{parameter['name']}` ({kind})", f": {plain(meaning)}", ""]
        return "\n".join(rows)

    def member_errors(self, member):
        if not member["errors"]:
            return ""
        rows = ["## Errors", ""]
        for error in member["errors"]:
            number = error["number"]
            rows += [f"**{number}**" + (f" {plain(ERRORS[number])}" if number in ERRORS else ""),
                     f": {plain(error['when'])}", ""]
        return "\n".join(rows)

    def names(self, heading, names, page):
        return f"## {heading}\n\n" + ", ".join(self.link(name, page) for name in names) + "\n" if names else ""

    def examples(self, subject):
        parts = []
        for example in subject["examples"]:
            title = f": {plain(example['title'])}" if example["title"] else ""
            parts.append(f"## Example{title}\n\n```vbscript\n{example['code']}\n```\n")
        return "\n".join(parts)

    def member(self, owner, member):
        name = self.full_name(owner, member)
        page = self.pages[name]
        family = self.family_page(owner, member["family"])
        kind = {"call": "method", "get": "property, can only be read", "put": "property, can only be put"}
        usage = "" if owner is not self.classes[0] else (
            f"## On the command line\n\n```\ntalutil call {member['name']}" +
            "".join(f" [{p['name']}]" if p["optional"] else f" {p['name']}" for p in member["parameters"]) + "\n```\n")
        above = posixpath.relpath(family, posixpath.dirname(page))
        self.write(page, "\n".join([
            "---\norphan: true\n---", f"# {name}", "",
            f"{self.link(owner['name'], page)} › [{member['family']}]({above}) ›"
            f" {kind.get(member['access'], 'property')}", "",
            plain(member["summary"] + ("" if member["details"].startswith("\n") else " ") + member["details"]), "",
            f"```text\n{member['signature']}\n```", "", self.arguments(member), self.member_errors(member),
            self.names("Settings read", member["reads"], page), self.names("Settings changed", member["changes"], page),
            self.examples(member), self.names("See also", member["see"], page), usage]))

    # ---- Lists

    def listed(self, owner, members, page):
        rows = []
        for member in sorted(members, key=lambda member: member["name"].lower()):
            rows += [self.link(self.full_name(owner, member), page), f": {plain(member['summary'])}", ""]
        return "\n".join(rows)

    def class_page(self, owner):
        page = self.pages[owner["name"]]
        parts = [f"# {owner['name']}", "", plain(owner["summary"]) + " " + plain(owner["details"]), "",
                 f"Created by `CreateObject(\"{owner['program_id']}\")`.", "", self.examples(owner)]
        if owner is self.classes[0]:
            parts += ["## Families", ""]
        for family in self.families:
            members = [member for member in owner["members"] if member["family"] == family]
            if not members:
                continue
            if owner is self.classes[0]:
                family_page = self.family_page(owner, family)
                title = family.capitalize()
                self.write(family_page, f"# {title}\n\nMembers of {self.link(owner['name'], family_page)}.\n\n" +
                           self.listed(owner, members, family_page))
                parts += [f"[{title}]({posixpath.basename(family_page)})",
                          ": " + " ".join(self.link(member["name"], page) for member in members), ""]
            else:
                parts += ["## Members", "", self.listed(owner, members, page)]
        self.write(page, "\n".join(parts))

    def names_page(self):
        page = "reference/names.md"
        parts, letter = ["# All members by name", ""], ""
        members = [(member["name"], owner, member) for owner in self.classes for member in owner["members"]]
        for name, owner, member in sorted(members, key=lambda row: (row[0].lower(), row[1]["name"])):
            if name[0].upper() != letter:
                letter = name[0].upper()
                parts += [f"## {letter}", ""]
            shown = f"`{name}`" if owner is self.classes[0] else f"`{name}` of {owner['name']}"
            target = posixpath.relpath(self.pages[self.full_name(owner, member)], "reference")
            parts += [f"[{shown}]({target})", f": {plain(member['summary'])}", ""]
        self.write(page, "\n".join(parts))

    # ---- The pages of docs

    def mended(self, text, source):
        """A page whose links lead to pages of the site."""
        def replace(match):
            is_picture, shown, target = match.group(1), match.group(2), match.group(3)
            path, _, anchor = target.partition("#")
            if re.match(r"\w+:", target) or not path:
                return match.group(0)
            full = posixpath.normpath(posixpath.join(posixpath.dirname(source), path))
            to = None
            if full == "docs/reference.md":
                to = self.anchors.get(anchor, "reference/names.md")
                anchor = ""
            elif full in TOP_PAGES and os.path.exists(os.path.join(TOP, full)):
                to = TOP_PAGES[full]
            elif full.startswith("docs/") and re.search(r"\.(md|png)$", full):
                to = full
            if not to:
                return f"`{full}`" if shown in (path, full) else f"{shown} (`{full}`)"
            here = TOP_PAGES.get(source, source)
            return f"{is_picture}[{shown}]({posixpath.relpath(to, posixpath.dirname(here) or '.')}" + \
                   (f"#{anchor}" if anchor else "") + ")"
        text = text.replace("```vb\n", "```vbscript\n")
        return re.sub(r"(!?)\[([^\]]*)\]\(([^)\s]+)\)", replace, text)

    def copy_documents(self):
        for folder, _, files in os.walk(os.path.join(TOP, "docs")):
            for name in files:
                path = os.path.join(folder, name)
                source = os.path.relpath(path, TOP)
                if name.endswith(".md") and source != "docs/reference.md":
                    with open(path, encoding="utf-8") as page:
                        self.write(source, self.mended(page.read(), source))
                elif name.endswith(".png"):
                    os.makedirs(os.path.dirname(os.path.join(self.folder, source)), exist_ok=True)
                    shutil.copyfile(path, os.path.join(self.folder, source))
        for source, page in TOP_PAGES.items():
            if os.path.exists(os.path.join(TOP, source)):
                with open(os.path.join(TOP, source), encoding="utf-8") as text:
                    self.write(page, self.mended(text.read(), source))

    def contents(self, caption, pages):
        return f"```{{toctree}}\n:hidden:\n:caption: {caption}\n\n" + "\n".join(pages) + "\n```\n"

    def index(self):
        def present(folder):
            path = os.path.join(self.folder, folder)
            return sorted(f"{folder}/{name}" for name in os.listdir(path) if name.endswith(".md")) \
                if os.path.isdir(path) else []
        documents = present("docs")
        first = [f"docs/{name}.md" for name in GUIDES if f"docs/{name}.md" in documents]
        guides = sorted(present("docs/guides"), key=lambda page: (not page.endswith("README.md"), page))
        families = [self.family_page(self.classes[0], family) for family in self.families
                    if any(member["family"] == family for member in self.classes[0]["members"])]
        others = [self.pages[owner["name"]] for owner in self.classes]
        with open(os.path.join(self.folder, "index.md"), encoding="utf-8") as readme:
            text = readme.read()
        self.write("index.md", "\n".join([
            text, self.contents("Guides", guides + first),
            self.contents("Reference", ["reference/names.md"] + others),
            self.contents("Members by family", families),
            self.contents("Background", [page for page in documents if page not in first] +
                          [page for page in TOP_PAGES.values()
                           if page != "index.md" and os.path.exists(os.path.join(self.folder, page))])]))


def main(arguments):
    if len(arguments) != 2:
        print(__doc__, file=sys.stderr)
        return 2
    with open(arguments[0], encoding="utf-8") as source:
        site = Site(json.load(source), arguments[1])
    shutil.rmtree(arguments[1], ignore_errors=True)
    for owner in site.classes:
        site.class_page(owner)
        for member in owner["members"]:
            site.member(owner, member)
    site.names_page()
    site.copy_documents()
    site.index()
    os.makedirs(os.path.join(arguments[1], "static"))
    for name, copy in (("site_conf.py", "conf.py"), ("site.css", "static/site.css")):
        shutil.copyfile(os.path.join(TOP, "tools", name), os.path.join(arguments[1], copy))
    return 0


if __name__ == "__main__":
    sys.exit(main(sys.argv[1:]))
