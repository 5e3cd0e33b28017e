#!/usr/bin/env python3
"""interface.py INCLUDE_DIR: the binary interface that the installed headers declare, as text.

A line for each function, constant, enumerator, field and place in a virtual table, with types, numbers and sizes as
g++ lays them out: whatever a program was compiled against and can no longer be changed without compiling it anew.
"""
import pathlib
import re
import subprocess
import sys
import tempfile


class Entry:
    """An entry of the debug information: a tag, attributes, and the entries inside it."""

    def __init__(self, tag, parent):
        self.tag, self.parent, self.attributes, self.inner = tag, parent, {}, []

    def get(self, attribute):
        return self.attributes.get(attribute, "")

    def number(self, attribute):
        return int(self.get(attribute).split()[0], 0)

    def scope(self):
        """The namespaces and classes around it, as PK::ColorSpace::"""
        around = self.parent
        if around is None or around.tag == "compile_unit":
            return ""
        return around.scope() + around.get("name") + "::"

    def name(self):
        return self.scope() + self.get("name")


def compiled(include, source):
    """What g++ tells of a source that uses the headers: its classes, and the debug information; without mangling."""
    options = ["-gdwarf-5", "-femit-class-debug-always", "-fno-eliminate-unused-debug-types",
               "-fno-eliminate-unused-debug-symbols", "-fdump-lang-class=classes"]
    with tempfile.TemporaryDirectory() as folder:
        def output(command):
            return subprocess.run(command + " | c++filt", shell=True, cwd=folder, check=True, capture_output=True,
                                  text=True).stdout

        pathlib.Path(folder, "interface.cpp").write_text(source)
        subprocess.run(["g++", "-std=c++20", *options, f"-I{include}", "-c", "interface.cpp"], cwd=folder, check=True)
        return output("cat classes"), output("readelf --debug-dump=info interface.o")


def parsed(dump):
    entries, around, entry = {}, [], None
    for line in dump.splitlines():
        if found := re.match(r" <(\w+)><(\w+)>: Abbrev Number: \d+ \(DW_TAG_(\w+)\)", line):
            depth = int(found[1], 16)
            del around[depth:]
            entry = Entry(found[3], around[-1] if around else None)
            if around:
                around[-1].inner.append(entry)
            around.append(entry)
            entries[int(found[2], 16)] = entry
        elif found := re.match(r"    <\w+>   DW_AT_(\w+) *: (?:\(.*?string.*?\): )?(.*)", line):
            entry.attributes[found[1]] = found[2].strip()
    for entry in entries.values():
        for attribute in ("type", "containing_type"):
            if attribute in entry.attributes:
                entry.attributes[attribute] = entries[int(re.search(r"<0x(\w+)>", entry.attributes[attribute])[1], 16)]
    return list(entries.values())


def spelled(entry):
    """A type as the headers write it; type names of their own are lines of the table."""
    of = entry.get("type") if entry else None
    match entry.tag if entry else "void":
        case "void":
            return "void"
        case "pointer_type":
            return pointer(of, "*")
        case "reference_type":
            return pointer(of, "&")
        case "rvalue_reference_type":
            return pointer(of, "&&")
        case "const_type":
            return spelled(of) + " const"
        case "array_type":
            counts = [inner.number("upper_bound") + 1 for inner in entry.inner if inner.tag == "subrange_type"]
            return spelled(of) + "".join(f"[{count}]" for count in counts)
        case "subroutine_type":
            return spelled(of) + parameters(entry)
    return entry.name()


def pointer(of, mark):
    if of and of.tag == "subroutine_type":
        return spelled(of.get("type")) + f" ({mark})" + parameters(of)
    return spelled(of) + mark


def parameters(entry):
    return "(" + ", ".join(spelled(inner.get("type")) for inner in entry.inner
                           if inner.tag == "formal_parameter" and "artificial" not in inner.attributes) + ")"


def function(entry):
    """The name as nm shows it, and what mangling leaves out."""
    name = entry.get("linkage_name") or entry.name() + parameters(entry)
    is_static = entry.parent.tag.endswith("_type") and "object_pointer" not in entry.attributes
    return name + " -> " + spelled(entry.get("type")) + (" (static)" if is_static else "")


def enumeration(entry):
    yield f"enum {entry.name()}: {spelled(entry.get('type'))}"
    for inner in entry.inner:
        if inner.tag == "enumerator":
            yield f"    {inner.get('name')} = {inner.number('const_value')}"


class Classes:
    """Sizes, alignments and virtual tables."""

    def __init__(self, dump):
        self.sizes = dict(re.findall(r"^Class (.*)\n   (size=.*)$", dump, re.MULTILINE))
        self.tables = {name: re.findall(r"^\d+ +\(int \(\*\)\(\.\.\.\)\)(.*)", slots, re.MULTILINE)
                       for name, slots in re.findall(r"^Vtable for (.*)\n((?:.+\n)*)", dump, re.MULTILINE)}

    def is_pure(self, function):
        """Functions follow two words of the class."""
        return self.tables[function.get("containing_type").name()][2 + place_in_table(function)] == "__cxa_pure_virtual"


def is_virtual(function):
    return "vtable_elem_location" in function.attributes


def place_in_table(function):
    return int(re.search(r"DW_OP_constu: (\d+)", function.get("vtable_elem_location"))[1])


def layout(entry, classes):
    yield f"struct {entry.name()}: {classes.sizes[entry.name()]}"
    fields = [inner for inner in entry.inner if "data_member_location" in inner.attributes]
    for field in sorted(fields, key=lambda field: field.number("data_member_location")):
        what = "inherits" if field.tag == "inheritance" else field.get("name") + ":"
        yield f"    at {field.number('data_member_location')} {what} {spelled(field.get('type'))}"
    for inner in filter(is_virtual, entry.inner):
        yield f"    virtual {place_in_table(inner)} {function(inner)}" + (" (pure)" if classes.is_pure(inner) else "")


def is_exported(entry, classes):
    """A function that stands in the library; what the compiler writes where it is used does not."""
    is_written = not {"artificial", "defaulted", "deleted", "inline"} & entry.attributes.keys()
    return "external" in entry.attributes and is_written and not (is_virtual(entry) and classes.is_pure(entry))


def table(entries, classes):
    functions, names, groups = [], [], []
    for entry in entries:
        # Names of the language and of its library begin with underscores, end in _t or stand in namespaces of their own.
        if re.match(r"(std|__\w+)::|__|\w+_t$", entry.name()) or entry.scope().endswith("()::"):
            continue
        is_top = entry.parent is not None and entry.parent.tag in ("compile_unit", "namespace")
        is_type = entry.tag in ("structure_type", "class_type", "union_type")
        if entry.tag == "subprogram" and is_exported(entry, classes):
            functions.append(function(entry))
        elif entry.tag == "variable" and is_top and "const_value" in entry.attributes:
            names.append(f"const {entry.name()}: {spelled(entry.get('type'))} = {entry.number('const_value'):#x}")
        elif entry.tag == "typedef" and is_top:
            names.append(f"type {entry.name()} = {spelled(entry.get('type'))}")
        elif entry.tag == "enumeration_type":
            groups.append("\n".join(enumeration(entry)))
        elif is_type and "name" in entry.attributes and "declaration" not in entry.attributes:
            groups.append("\n".join(layout(entry, classes)))
            if entry.name() in classes.tables:
                functions += [f"{what} for {entry.name()}" for what in ("typeinfo", "typeinfo name", "vtable")]
    return sorted(set(functions)) + [""] + sorted(names) + [""] + sorted(groups)


def main():
    include = pathlib.Path(sys.argv[1]).resolve()
    text = " ".join(re.sub("//.*|#.*", "", header.read_text()) for header in sorted(include.glob("PixelKiln/*.h")))
    # The debug information has those functions of which an address is taken.
    exported = re.findall(r"PK_API[^;({]*\b(\w+(?:<\w+>)?)\(", text, re.ASCII)
    source = "#include <PixelKiln/PixelKiln.h>\nusing namespace PK;\nvoid* const addresses[] = {" + "".join(
        f"\n    reinterpret_cast<void*>({name})," for name in exported) + "\n};\n"
    classes, debug = compiled(include, source)
    print("\n".join(table(parsed(debug), Classes(classes))))


main()
