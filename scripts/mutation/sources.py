"""The mutations that there are in a source, without those places of it that compute nothing."""
import dataclasses
import hashlib
import re

from mutation.patterns import PATTERNS

# Comments, texts, characters (a digit's separator is none), preprocessor lines, assertions, declarations that only give
# names, and those of arrays with their counts: a longer one does no harm.
NO_CODE = re.compile(
    r"""//[^\n]*
    |/\*.*?\*/
    |R"(?P<end>\w*)\(.*?\)(?P=end)"
    |"(?:[^"\\\n]|\\.)*"
    |(?<!\w)'(?:[^'\\\n]|\\.)+'
    |^[ ]*\#(?:[^\n\\]|\\.)*
    |\bstatic_assert\((?:[^;"]|"[^"]*")*;
    |(?<=\w[ ])(?<!return[ ])\w+(?:\[\w+\])+
    |\b(?:using|namespace|template)\b[^;{()]*?[;{>]""", re.VERBOSE | re.MULTILINE | re.DOTALL)


def code_of(text):
    """The text with what is no code blanked, every character at its place."""
    def blank(found):
        return re.sub(r"[^\n]", TEXT if found[0][0] in "R\"'" else " ", found[0])

    return NO_CODE.sub(blank, text)


TEXT = "\0"  # stands for each character of one


@dataclasses.dataclass(frozen=True)
class Mutation:
    path: str
    start: int
    end: int
    new: str
    pattern: str
    line: int
    before: str  # the line
    after: str
    step: str = ""

    def applied(self, text):
        return text[:self.start] + self.new + text[self.end:]

    def block(self):
        """As it is shown, and noted in equivalent.txt."""
        return f"{self.path}\n- {self.before}\n+ {self.after}\n"

    def key(self):
        return (self.path, self.before, self.after)


def mutations_of(path, text):
    code = code_of(text)
    found = {}
    for pattern in PATTERNS:
        for start, end, new in pattern.changes(code):
            line_start, line_end = text.rfind("\n", 0, start) + 1, text.find("\n", end)
            line_end = len(text) if line_end < 0 else line_end
            before, after = text[line_start:line_end], text[line_start:start] + new + text[end:line_end]
            if TEXT in code[start:end]:
                continue  # messages, mostly
            found.setdefault((start, end, new), Mutation(
                path, start, end, new, pattern.name, text.count("\n", 0, start) + 1, before.strip(), after.strip(),
                pattern.step))
    return sorted(found.values(), key=lambda mutation: (mutation.start, mutation.end, mutation.new))


def drawn(mutations, count, random):
    """So many of them, of each pattern in turn, and at each place one at most: numbers are many, and locks few."""
    by_pattern = {}
    for mutation in random.sample(mutations, len(mutations)):
        by_pattern.setdefault(mutation.pattern, []).append(mutation)
    patterns = random.sample(sorted(by_pattern), len(by_pattern))
    places, chosen = set(), []
    while any(by_pattern.values()) and (not count or len(chosen) < count):
        for pattern in patterns:
            while by_pattern[pattern]:
                mutation = by_pattern[pattern].pop()
                place = (mutation.path, mutation.start)
                if not count or place not in places:
                    places.add(place)
                    chosen.append(mutation)
                    break
    return chosen[:count] if count else chosen


def digest(texts):
    """What tells one tree from another; texts by path."""
    total = hashlib.sha256()
    for path in sorted(texts):
        total.update(path.encode() + b"\0" + texts[path] + b"\0")
    return total.hexdigest()[:16]
