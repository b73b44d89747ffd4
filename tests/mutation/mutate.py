#!/usr/bin/python3
"""Writes every mutant of source/ and support/ into one copy of the tree: each is an expression or a statement that
asks, when it is reached, whether it is the one that is on. So all of them are built once.

usage: mutate.py TREE COMMANDS LIST
  TREE      the copy; its source/ and support/ are changed
  COMMANDS  the folder with the compile_commands.json of the copy, before it is changed
  LIST      gets a line of JSON for each mutant: number, file, line, kind, and what becomes what
"""
import dataclasses
import concurrent.futures
import json
import os
import pathlib
import re
import shlex
import shutil
import subprocess
import sys

from clang.cindex import CursorKind, Index, TranslationUnit, TypeKind

COMPARISONS = {
    "==": ["!="], "!=": ["=="], "<": ["<=", ">="], "<=": ["<", ">"], ">": [">=", "<="], ">=": [">", "<"]
}
ARITHMETIC = {
    "+": "-", "-": "+", "*": "/", "/": "*", "%": "*", "<<": ">>", ">>": "<<", "&": "|", "|": "&", "^": "&",
    "+=": "-=", "-=": "+=", "*=": "/=", "/=": "*=", "<<=": ">>=", ">>=": "<<=", "&=": "|=", "|=": "&="
}
# Evaluated when it is compiled, or no code of its own.
SKIPPED = {
    CursorKind.STATIC_ASSERT, CursorKind.ENUM_DECL, CursorKind.TYPEDEF_DECL, CursorKind.TYPE_ALIAS_DECL,
    CursorKind.USING_DECLARATION, CursorKind.CXX_UNARY_EXPR, CursorKind.TEMPLATE_NON_TYPE_PARAMETER,
    CursorKind.TEMPLATE_TYPE_PARAMETER
}
DECLARED = {CursorKind.VAR_DECL, CursorKind.FIELD_DECL, CursorKind.PARM_DECL}
NAMED = {CursorKind.DECL_REF_EXPR, CursorKind.MEMBER_REF_EXPR}
FUNCTIONS = {
    CursorKind.CXX_METHOD, CursorKind.FUNCTION_DECL, CursorKind.FUNCTION_TEMPLATE, CursorKind.CONSTRUCTOR,
    CursorKind.DESTRUCTOR, CursorKind.CONVERSION_FUNCTION
}
CALLS = {CursorKind.CALL_EXPR, CursorKind.CXX_DELETE_EXPR}
ASSIGNING = {CursorKind.BINARY_OPERATOR, CursorKind.COMPOUND_ASSIGNMENT_OPERATOR, CursorKind.UNARY_OPERATOR}
NUMBERS = {
    TypeKind.BOOL, TypeKind.CHAR_U, TypeKind.UCHAR, TypeKind.USHORT, TypeKind.UINT, TypeKind.ULONG,
    TypeKind.ULONGLONG, TypeKind.CHAR_S, TypeKind.SCHAR, TypeKind.SHORT, TypeKind.INT, TypeKind.LONG,
    TypeKind.LONGLONG, TypeKind.FLOAT, TypeKind.DOUBLE, TypeKind.LONGDOUBLE
}


class Command:
    """How a file is compiled."""

    def __init__(self, entry):
        self.filename, self.directory = entry["file"], entry["directory"]
        arguments = shlex.split(entry["command"])
        if arguments[0].endswith("ccache"):
            del arguments[0]
        output = arguments.index("-o")
        #: Without what is compiled to where.
        self.arguments = arguments[:output]


@dataclasses.dataclass(frozen=True)
class Edit:
    """What replaces the text from begin to end while its mutant is on."""
    begin: int
    end: int
    kind: str
    text: str
    # An expression; or a statement, left out or put before.
    form: str = "expression"
    # Edits of one name are one mutant: two arguments that change places.
    name: str = ""


class File:
    """A file that is mutated, and the edits found so far."""

    def __init__(self, path):
        self.path = path
        self.octets = path.read_bytes()
        self.edits = {}
        self.seen = set()

    def text(self, begin, end):
        return self.octets[begin:end].decode()

    def add(self, edit):
        if edit.text != self.text(edit.begin, edit.end):
            self.edits[edit] = None


def one_line(text):
    """The lines of the copy are those of the original."""
    return re.sub(r"\s*\n\s*", " ", re.sub(r"//[^\n]*", "", text))


class Finder:
    """Finds what can be changed in the files of one translation unit."""

    def __init__(self, files, unit):
        self.files = files
        self.macros = {}
        self.unit = unit
        for cursor in unit.cursor.get_children():
            if cursor.kind == CursorKind.MACRO_INSTANTIATION and cursor.location.file:
                span = (cursor.extent.start.offset, cursor.extent.end.offset)
                self.macros.setdefault(str(cursor.location.file), []).append(span)

    def run(self):
        for cursor in self.unit.cursor.get_children():
            if cursor.location.file and str(cursor.location.file) in self.files:
                self.walk(cursor)

    def walk(self, cursor):
        if cursor.kind in SKIPPED:
            return
        where = cursor.location.file
        if where is None or str(where) not in self.files:
            return
        self.file = self.files[str(where)]
        if cursor.kind in (CursorKind.VAR_DECL, CursorKind.UNEXPOSED_DECL) and self.is_constant(cursor):
            return
        children = list(cursor.get_children())
        if not self.in_macro(cursor, str(where)):
            self.find(cursor, children)
        for index, child in enumerate(children):
            if not self.is_compiled_in(cursor, child, index):
                self.walk(child)

    def is_compiled_in(self, cursor, child, index):
        """Whether a part is a constant to the compiler: a template's argument, a case."""
        if cursor.kind in FUNCTIONS | DECLARED:
            is_size = cursor.type.kind == TypeKind.CONSTANTARRAY and child.kind != CursorKind.INIT_LIST_EXPR
            return is_size or child.extent.start.offset < cursor.location.offset
        if cursor.kind in NAMED:
            return child.kind == CursorKind.INTEGER_LITERAL
        if cursor.kind == CursorKind.IF_STMT:
            return index == 0 and self.is_constexpr_if(cursor, child)
        return cursor.kind == CursorKind.CASE_STMT and index == 0

    def span(self, cursor):
        return cursor.extent.start.offset, cursor.extent.end.offset

    def text_of(self, cursor):
        return self.file.text(*self.span(cursor))

    def in_macro(self, cursor, where):
        begin, end = self.span(cursor)
        return any(first <= begin and end <= last for first, last in self.macros.get(where, []))

    def is_constant(self, cursor):
        begin, _ = self.span(cursor)
        return "constexpr" in self.file.text(begin, cursor.location.offset)

    def is_constexpr_if(self, statement, condition):
        begin, _ = self.span(statement)
        return "constexpr" in self.file.text(begin, self.span(condition)[0])

    def add(self, cursor, kind, text, **more):
        begin, end = self.span(cursor)
        self.file.add(Edit(begin, end, kind, one_line(text), **more))

    def find(self, cursor, children):
        kind = cursor.kind
        if kind in (CursorKind.BINARY_OPERATOR, CursorKind.COMPOUND_ASSIGNMENT_OPERATOR) and len(children) == 2:
            self.operator(cursor, children[0], children[1])
        elif kind == CursorKind.CALL_EXPR:
            self.call(cursor, children)
        elif kind == CursorKind.UNARY_OPERATOR:
            self.unary(cursor, children[0])
        elif kind in (CursorKind.IF_STMT, CursorKind.CONDITIONAL_OPERATOR):
            self.condition(cursor, children[0])
        elif kind in (CursorKind.INTEGER_LITERAL, CursorKind.FLOATING_LITERAL):
            self.add(cursor, "constant", self.text_of(cursor) + " + 1")
        elif kind == CursorKind.CHARACTER_LITERAL:
            self.add(cursor, "constant", "'~'")
        elif kind == CursorKind.CXX_BOOL_LITERAL_EXPR:
            self.add(cursor, "constant", "false" if self.text_of(cursor) == "true" else "true")
        elif kind == CursorKind.STRING_LITERAL and self.text_of(cursor).startswith('"'):
            self.add(cursor, "constant", '""')
        elif kind == CursorKind.DECL_REF_EXPR:
            self.reference(cursor)
        elif kind == CursorKind.RETURN_STMT and children:
            self.result(cursor, children[0])
        elif kind == CursorKind.COMPOUND_STMT:
            for child in children:
                self.statement(child)

    def operator(self, cursor, left, right):
        between = self.file.text(self.span(left)[1], self.span(right)[0])
        operator = re.sub(r"//[^\n]*", "", between).strip()
        start, end = one_line(self.text_of(left)), one_line(self.text_of(right))
        for other in COMPARISONS.get(operator, []):
            self.add(cursor, "comparison", f"{start} {other} {end}")
        if operator in ARITHMETIC:
            self.add(cursor, "arithmetic", f"{start} {ARITHMETIC[operator]} {end}")
        if operator in ("&&", "||"):
            self.add(cursor, "condition", start)
            self.add(cursor, "condition", end)

    def call(self, cursor, children):
        if len(children) == 3 and re.fullmatch(r"operator(==|!=|<|<=|>|>=|\+|-)", cursor.spelling):
            if self.span(children[0])[1] <= self.span(children[1])[0]:
                self.operator(cursor, children[0], children[2])
        if cursor.spelling.startswith("operator") or cursor.spelling in ("max", "min", "swap"):
            return
        arguments = list(cursor.get_arguments())
        for number in range(len(arguments) - 1):
            one, two = arguments[number:number + 2]
            if one is None or two is None or one.type.get_canonical().spelling != two.type.get_canonical().spelling:
                continue
            (first, first_end), (second, second_end) = self.span(one), self.span(two)
            if first_end > second or first == first_end or second == second_end:
                continue
            texts = one_line(self.text_of(one)), one_line(self.text_of(two))
            if texts[0] == texts[1]:
                continue
            name = f"{first}:{second}"
            self.add(one, "swap", texts[1], name=name)
            self.add(two, "swap", texts[0], name=name)

    def unary(self, cursor, operand):
        begin, end = self.span(cursor)
        operand_begin, operand_end = self.span(operand)
        before, after = self.file.text(begin, operand_begin).strip(), self.file.text(operand_end, end).strip()
        text = one_line(self.text_of(operand))
        if before in ("!", "-", "~"):
            self.add(cursor, "condition" if before == "!" else "arithmetic", text)
        for sign, other in (("++", "--"), ("--", "++")):
            if before == sign:
                self.add(cursor, "arithmetic", other + text)
            if after == sign:
                self.add(cursor, "arithmetic", text + other)

    def condition(self, cursor, condition):
        if cursor.kind == CursorKind.IF_STMT and self.is_constexpr_if(cursor, condition):
            return
        if condition.kind in (CursorKind.VAR_DECL, CursorKind.DECL_STMT):
            return
        self.add(condition, "condition", "true")
        self.add(condition, "condition", "false")

    def reference(self, cursor):
        declared = cursor.referenced
        if declared is None or declared.kind != CursorKind.VAR_DECL:
            return
        if not declared.type.is_const_qualified() or declared.type.get_canonical().kind not in NUMBERS:
            return
        if declared.semantic_parent.kind in FUNCTIONS:
            return
        self.add(cursor, "constant", self.text_of(cursor) + " + 1")

    def result(self, cursor, value):
        text = one_line(self.text_of(value))
        if value.type.get_canonical().kind == TypeKind.BOOL:
            if value.kind not in (CursorKind.CXX_BOOL_LITERAL_EXPR, CursorKind.BINARY_OPERATOR):
                self.add(value, "return", f"!({text})")
        elif text not in ("{}", "nullptr", "0", "'\\0'"):
            self.add(cursor, "return", "return {};", form="before")

    def statement(self, cursor):
        inner = cursor
        while inner.kind == CursorKind.UNEXPOSED_EXPR:
            children = list(inner.get_children())
            if len(children) != 1 or self.span(children[0]) != self.span(inner):
                break
            inner = children[0]
        if inner.kind in CALLS or inner.kind in ASSIGNING:
            if not self.in_macro(cursor, str(cursor.location.file)):
                self.add(cursor, "statement", "", form="left out")


def mutated(file, begin, end, edits, numbers):
    """The text from begin to end with the edits, all of which are inside. Outer ones come first."""
    pieces, at = [], begin
    index = 0
    while index < len(edits):
        edit = edits[index]
        inner_end = index + 1
        while inner_end < len(edits) and edits[inner_end].begin < edit.end:
            inner_end += 1
        pieces.append(file.text(at, edit.begin))
        inner = mutated(file, edit.begin, edit.end, edits[index + 1:inner_end], numbers)
        on = f"vantelMutant({numbers[edit]})"
        if edit.form == "expression":
            pieces.append(f"({on} ? {edit.text} : {inner})")
        elif edit.form == "before":
            pieces.append(f"if ({on}) {edit.text} {inner}")
        else:
            pieces.append(f"if (!{on}) {inner}")
        at = edit.end
        index = inner_end
    pieces.append(file.text(at, end))
    return "".join(pieces)


def nests(edits):
    """Drops what crosses another edit, as two halves of a macro would."""
    kept, open_ends = [], []
    for edit in edits:
        while open_ends and open_ends[-1] <= edit.begin:
            open_ends.pop()
        if open_ends and edit.end > open_ends[-1]:
            continue
        kept.append(edit)
        open_ends.append(edit.end)
    return kept


def write(files, dropped):
    """Writes the files, and returns the mutants by number."""
    mutants, number = {}, 0
    for file in files.values():
        edits = [edit for edit in file.edits if (str(file.path), edit) not in dropped]
        order = {"before": 0, "left out": 1, "expression": 2}
        edits.sort(key=lambda edit: (edit.begin, -edit.end, order[edit.form]))
        edits = nests(edits)
        numbers, named = {}, {}
        for edit in edits:
            if edit.name and edit.name in named:
                numbers[edit] = named[edit.name]
                mutants[numbers[edit]].append((file, edit))
                continue
            number += 1
            numbers[edit] = number
            mutants[number] = [(file, edit)]
            if edit.name:
                named[edit.name] = number
        file.path.write_text(mutated(file, 0, len(file.octets), edits, numbers))
    return mutants


def find_edits(files, commands):
    folder = subprocess.run(["clang", "-print-resource-dir"], capture_output=True, text=True, check=True).stdout
    for command in commands:
        unit = Index.create().parse(
            command.filename, command.arguments[1:] + ["-isystem", f"{folder.strip()}/include"],
            options=TranslationUnit.PARSE_DETAILED_PROCESSING_RECORD)
        wrong = [str(one) for one in unit.diagnostics if one.severity >= one.Error]
        if wrong:
            sys.exit("\n".join(wrong))
        Finder(files, unit).run()


def refused_by(command):
    """Where the compiler finds errors: file, line and column."""
    arguments = command.arguments + ["-fsyntax-only", "-fmax-errors=0", command.filename]
    result = subprocess.run(arguments, cwd=command.directory, capture_output=True, text=True)
    found = re.findall(r"^([^ \n:]+):(\d+):(\d+): (?:fatal )?error:", result.stderr, re.MULTILINE)
    if result.returncode != 0 and not found:
        sys.exit(result.stderr)
    return {(name, int(line), int(column)) for name, line, column in found}


def closing(text, opening):
    depth = 0
    for at in range(opening, len(text)):
        depth += {"(": 1, ")": -1}.get(text[at], 0)
        if depth == 0:
            return at
    return len(text)


def numbers_at(line, column, mutants):
    """The mutants to blame for an error: the innermost one around it, else the statements of the line, else all."""
    found = [(match.start() - 1, int(match[1])) for match in re.finditer(r"vantelMutant\((\d+)\)", line)]
    around = [number for begin, number in found if begin < column <= closing(line, max(begin, 0)) + 1]
    numbers = [number for _, number in found]
    statements = [number for number in numbers if any(edit.form != "expression" for _, edit in mutants[number])]
    return around[-1:] or statements or numbers


def drop_refused(files, commands):
    dropped = set()
    while True:
        mutants = write(files, dropped)
        with concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as pool:
            refused = set().union(*pool.map(refused_by, commands))
        if not refused:
            return mutants
        before = len(dropped)
        for name, line, column in refused:
            path = str(pathlib.Path(name).resolve())
            if path not in files:
                sys.exit(f"{name}:{line}: an error outside of what is mutated")
            lines = files[path].path.read_text().splitlines()
            for number in numbers_at(lines[line - 1], column, mutants):
                dropped |= {(str(file.path), edit) for file, edit in mutants[number]}
        if len(dropped) == before:
            sys.exit(f"errors that no mutant explains: {sorted(refused)}")
        print(f"{len(dropped)} that the compiler refuses", file=sys.stderr)


def keep_times(files, kept):
    """What is written as it was before is not built again."""
    for file in files.values():
        before = kept / file.path.name
        text = file.path.read_bytes()
        if before.exists() and before.read_bytes() == text:
            times = before.stat()
            os.utime(file.path, ns=(times.st_atime_ns, times.st_mtime_ns))
        else:
            before.write_bytes(text)
            shutil.copystat(file.path, before)


def describe(number, parts, tree):
    file, edit = parts[0]
    was = one_line(file.text(edit.begin, edit.end))
    if edit.kind == "swap":
        becomes, was = f"{edit.text}, {was}", f"{was}, {edit.text}"
    else:
        becomes = edit.text
    line = file.text(0, edit.begin).count("\n")
    return {
        "number": number, "file": str(file.path.relative_to(tree)), "line": line + 1, "kind": edit.kind,
        "was": was, "becomes": becomes, "text": file.octets.decode().splitlines()[line].strip()
    }


def main():
    tree, folder, output = (pathlib.Path(argument).resolve() for argument in sys.argv[1:])
    paths = [path for part in ("source", "support") for path in sorted((tree / part).rglob("*"))
             if path.suffix in (".h", ".cpp")]
    files = {str(path): File(path) for path in paths}
    entries = json.loads((folder / "compile_commands.json").read_text())
    commands = [Command(entry) for entry in entries if entry["file"] in files]
    find_edits(files, commands)
    mutants = drop_refused(files, commands)
    kept = output.parent / "written"
    kept.mkdir(exist_ok=True)
    keep_times(files, kept)
    with output.open("w") as text:
        for number, parts in mutants.items():
            text.write(json.dumps(describe(number, parts, tree)) + "\n")
    print(f"{len(mutants)} mutants in {len(paths)} files", file=sys.stderr)


main()
