"""What Doxygen reads instead of a header or a page; the files themselves stay plain.

Headers: a comment applies to the declarations below it, up to a blank line or the next comment; a
declaration followed by a comment has only that one. "As in CLASS." stands for the comment of the
member of the same name there. The comment that opens the file is the file's. Lines keep their
numbers, so that warnings name the right ones.
Pages: headings, links between pages and pictures, as Doxygen wants them.
"""
import collections
import html
import os
import pathlib
import re

# --- comments -----------------------------------------------------------------------------------

LABELS = "Requires|Fails|Cost|Deliberate|Threads|Invariants"
CODE = re.compile(r'"[^"]+"|(?<![\w"])\'[A-Za-z_][\w *]*\'')
SPECIAL = re.compile(r"[\\@#%*$]")


def escape(text):
    text = text.replace("&", "&amp;").replace("<", "&lt;").replace(">", "&gt;")
    return SPECIAL.sub(lambda match: "\\" + match[0], text)


def markup(text):
    """Plain text, with quoted pieces as code and nothing that Doxygen takes for a command."""
    pieces, end = [], 0
    for match in CODE.finditer(text):
        code = match[0] if match[0][0] == '"' else match[0][1:-1]
        pieces += [escape(text[end:match.start()]), f"`{code}`"]
        end = match.end()
    text = "".join(pieces) + escape(text[end:])
    return re.sub(rf"(^|  |\n)({LABELS}):", r"<br><b>\2:</b>", text)


def as_doc(lines, subject=""):
    """The lines of a comment as a documentation comment on one line."""
    text, items = "", []
    for line in lines:
        item = re.match(r"\d+\. (.*)", line)
        if item:
            items.append(item[1])
        elif items:
            items[-1] += " " + line
        else:
            separator = "\n" if re.match(rf"({LABELS}):", line) else " "
            text += (separator if text else "") + line
    text = text[:1].upper() + text[1:]
    if text[-1:] not in ".:":
        text += "."
    text = markup(text).replace("\n", " ").removeprefix("<br>")
    if items:
        text += "<ol>" + "".join(f"<li>{markup(item)}</li>" for item in items) + "</ol>"
    return f"/** {text}{subject} */"


def as_file_doc(lines):
    """The comment that opens a file, and the example in its indented lines."""
    text, example = [], []
    for line in lines:
        (example if line.startswith("//     ") else text).append(line)
    code = "<br>".join(escape(line[len("//     "):]) for line in example)
    subject = f" <pre>{code}</pre> @file" if example else " @file"
    words = [line[2:].strip() for line in text]
    return as_doc([line for line in words if line], subject)


# --- headers ------------------------------------------------------------------------------------

COPY = re.compile(r"/\*\* As in (\w+)\. \*/")
TRAILING = re.compile(r"(.*[;{,}\w)]) *// (.*)")
SCOPE = re.compile(r"\b(class|struct|enum|namespace)\b[^()]*\{$")
UNDOCUMENTED = re.compile(r"(class|struct) \w+;|friend |(public|private|protected):|\}|#|$")


class Header:
    def __init__(self, lines):
        self.lines = lines
        self.output = [""] * len(lines)
        self.comment = []      # of the declarations that follow
        self.statement = ""    # the declaration so far, if it continues on the next line
        self.body_depth = 0    # braces within a function's body
        self.in_enum = False
        self.bare_enumerators = []  # numbers of lines; Doxygen 1.9.4 silently ignores them

    def comment_at(self, index):
        block = []
        while index < len(self.lines) and self.lines[index].strip().startswith("//"):
            block.append(self.lines[index].strip()[2:].strip())
            index += 1
        return block, index

    def declaration(self, index, line, trailing):
        comment = [trailing] if trailing else self.comment
        indent = line[:len(line) - len(line.lstrip())]
        begins = not self.statement and not UNDOCUMENTED.match(line.strip())
        if begins and comment:
            name = re.search(r"(\w+) *\(", " ".join(self.lines[index:index + 2]))
            doc = COPY.sub(lambda match: f"/** @copydoc {match[1]}::{name[1]} */", as_doc(comment))
            line = f"{indent}{doc} {line.strip()}"
        elif begins and self.in_enum:
            self.bare_enumerators.append(index + 1)
        self.output[index] = line

    def follow(self, code):
        """Keeps track of where a declaration ends."""
        self.statement += " " + code.strip()
        opened, closed = code.count("{"), code.count("}")
        if SCOPE.search(self.statement) or code.strip().startswith("}"):
            self.in_enum = SCOPE.search(self.statement) and " enum " in self.statement
            self.statement, self.comment = "", []
        elif opened > closed:
            self.statement, self.body_depth = "", opened - closed
        elif code.rstrip().endswith((";", ",", ":", "}")) and self.is_whole():
            self.statement = ""

    def is_whole(self):
        return self.statement.count("(") == self.statement.count(")")

    def line(self, index):
        line = self.lines[index]
        if self.body_depth:
            self.body_depth += line.count("{") - line.count("}")
            self.output[index] = line
        elif index > 0 and self.lines[index - 1].endswith("\\"):
            self.output[index] = line  # a macro continues
        elif line.startswith("#"):
            define = re.match(r"#define (\w+)", line)
            trailing = TRAILING.match(line)
            comment = [trailing[2]] if trailing else self.comment
            self.output[index] = trailing[1] if trailing else line
            if define and comment:
                self.output[index - 1] += as_doc(comment, f" @def {define[1]}")
                self.comment = []
        elif not line.strip():
            self.comment = []
        else:
            trailing = TRAILING.match(line)
            code = trailing[1] if trailing else line
            self.declaration(index, code, trailing[2] if trailing else None)
            self.follow(code)

    def filter(self):
        _, index = self.comment_at(0)
        self.output[0] = as_file_doc(self.lines[:index])
        while index < len(self.lines):
            block, after = self.comment_at(index)
            if block and not self.body_depth:
                self.comment, index = block, after
            else:
                self.line(index)
                index += 1
        return self.output


# --- pages --------------------------------------------------------------------------------------

NO_BRACKETS = str.maketrans("", "", "[]")
HEADING_TARGET = re.compile(r"\[[^\]]+\]: \S+\.md#")  # a heading in brackets that links to itself
CODE_SPAN = re.compile(r"`([^`]+)`")
LINK = re.compile(r"(!?)\[([^\]]*)\]\(([^)\s]+)\)")


def page_name(path):
    return "page-" + pathlib.PurePath(path).stem.lower()


def slug(heading):
    """The anchor that a heading has if the page is read as it is."""
    heading = re.sub(r"[`*]", "", heading).strip().lower()
    return re.sub(r"[^\w\- ]", "", heading).replace(" ", "-")


def link(match, own_name):
    is_picture, text, target = match.groups()
    if is_picture:
        return f'<img src="{os.path.basename(target)}" alt="{html.escape(text)}">'
    file, _, anchor = target.partition("#")
    if "://" in target or (file and not file.endswith(".md")):
        return match[0]
    name = page_name(file) if file else own_name
    return f"[{text}](@ref {name}{'-' + anchor if anchor else ''})"


def code_span(match):
    """A quote would end it too early, and a bar in it would end a table's cell."""
    if "\\|" in match[1]:
        return "<code>" + escape(match[1].replace("\\|", "|")).replace("|", "\\|") + "</code>"
    return f"``{match[1]}``" if "'" in match[1] else match[0]


def filter_page(path, lines):
    name, fence, output, anchors = page_name(path), False, [], collections.Counter()
    for line in lines:
        heading = re.match(r"(#+) (.*)", line)
        if line.startswith("```"):
            fence = not fence
            kind = line[3:].split(" ")[0]
            line = "```" + ("{.cpp}" if kind == "cpp" else "{.unparsed}" if kind else "")
        elif not fence and heading:
            anchor = name if len(heading[1]) == 1 else f"{name}-{slug(heading[2])}"
            again = f"-{anchors[anchor]}" if anchors[anchor] else ""
            anchors[anchor] += 1
            line = f"{heading[1]} {heading[2].translate(NO_BRACKETS)} {{#{anchor}{again}}}"
        elif not fence and HEADING_TARGET.match(line):
            line = ""
        elif not fence:
            line = CODE_SPAN.sub(code_span, LINK.sub(lambda match: link(match, name), line))
        output.append(line)
    return output
