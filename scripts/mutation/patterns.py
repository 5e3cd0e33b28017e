"""The small changes that `scripts/mutate` makes.

A pattern is a name, an expression, what becomes of the part in its group (a list: each is a mutation of its own), and
an example: a line, and what it may become. `WORD` in an expression stands for the group of all words of a table.
Expressions see lines as clang-format lays them out, without comments, texts, assertions and preprocessor lines.

One more kind of change is one more entry. Its example is its test.
"""
import dataclasses
import re
import typing


@dataclasses.dataclass
class Pattern:
    name: str
    expression: str
    becomes: dict | typing.Callable[[str], list[str]]
    example: tuple[str, str]
    step: str = ""  # of .ci/run: what may see the change where the tests do not

    def __post_init__(self):
        if isinstance(self.becomes, dict):
            words = "|".join(re.escape(word) for word in sorted(self.becomes, key=len, reverse=True))
            self.expression = self.expression.replace("WORD", f"({words})")
        self.compiled = re.compile(self.expression, re.MULTILINE)

    def changes(self, text):
        """Start, end and new text of each change that it makes to a text."""
        for found in self.compiled.finditer(text):
            old = found[1]
            for new in self.becomes[old].split() if isinstance(self.becomes, dict) else self.becomes(old):
                yield found.start(1), found.end(1), new


def exchanged(*pairs):
    """Each word of a pair for the other."""
    return {word: other for pair in map(str.split, pairs) for word, other in (pair, reversed(pair))}


def without(_):
    return [""]


def empty(_):
    return [";"]


def one_more_or_less(number):
    base, form = (16, "#x") if number.startswith("0x") else (10, "d")
    value = int(number, base)
    return [format(value + 1, form)] + ([format(value - 1, form)] if value > 0 else [])


def a_little_more(number):
    """By one part in 4096: a wrong digit, which codes of eight bits show too if all borders between them are tried."""
    digits, suffix = re.fullmatch(r"(.*?)(f?)", number).groups()
    value = float.fromhex(digits) if digits.startswith("0x") else float(digits)
    changed = value * (1 + 1 / 4096) or 1 / 4096
    written = format(changed, ".9g" if suffix else ".17g")
    return [written + ("" if re.search("[.e]", written) else ".0") + suffix]


def negated(condition):
    return [f"!({condition})"]


def turned(separator):
    def becomes(both):
        first, second = both.split(separator)
        return [second + separator + first] if first != second else []

    return becomes


# Of these functions the arguments may stand in either order.
EITHER_ORDER = "Min|Max|MinHalves|min|max|Equal|MultiplyHalves|MultiplyHalvesHigh|AverageHalves|MultiplyAddHalves"
NESTED = r"(?:[^()\n]|\((?:[^()\n]|\([^()\n]*\))*\))+"  # what brackets hold, and brackets in it
PLACE = r"(?:[\w.:]|->|\[[^\]\n]*\])+"  # what is assigned to or called

PATTERNS = [
    Pattern("comparison", " WORD ", {"<": "<=", "<=": "<", ">": ">=", ">=": ">", "==": "!=", "!=": "=="},
            ("if (x < end) y();", "if (x <= end) y();")),
    Pattern("sign", " WORD ", exchanged("+ -"), ("x = a + b;", "x = a - b;")),
    Pattern("sum", " WORD ", exchanged("+= -="), ("x += b;", "x -= b;")),
    Pattern("product", r" (\*) ", lambda _: ["/"], ("x = a * b;", "x = a / b;")),
    Pattern("logic", " WORD ", exchanged("&& ||"), ("if (a && b) c();", "if (a || b) c();")),
    Pattern("bits", " WORD ", exchanged("& |"), ("x = a & 1;", "x = a | 1;")),
    Pattern("shift", r"(?<=\W)WORD(?=\W)", exchanged("<< >>", "ShiftLeft ShiftRight"),
            ("y = ShiftLeft<3>(x);", "y = ShiftRight<3>(x);")),
    Pattern("limit", r"\bWORD(?=[(<])", exchanged("min max", "Min Max", "AtMost AtLeast"),
            ("x = std::min(a, b);", "x = std::max(a, b);")),
    Pattern("rounding", r"\bWORD(?=\()", exchanged("Nearest Truncate", "floor ceil"),
            ("x = Nearest(a);", "x = Truncate(a);")),
    Pattern("number", r"(?<![\w.'])(0x[0-9a-f]+|\d+)(?![\w.'])", one_more_or_less,
            ("x = Ints(0x80);", "x = Ints(0x7f);")),
    Pattern("fraction", r"(?<![\w.])(0x[0-9a-f.]+p[-+]?\d+f?|\d+\.\d+(?:e[-+]?\d+)?f?|\d+e[-+]?\d+f?)(?![\w.])",
            a_little_more, ("x = 0.5f;", "x = 0.50012207f;")),
    # Names that are easily taken for each other; not where they are declared, behind a type.
    Pattern("name", r"\b(?:(?<=return )|(?<!\w )(?<!\w[*&>] ))WORD\b",
            exchanged("c0 c2", "c1 c3", "y0 y1", "even odd", "first second", "top bottom", "left right", "upper lower",
                      "before after", "width height", "rows columns", "source destination", "low high", "luma chroma"),
            ("x = pixel.c0;", "x = pixel.c2;")),
    Pattern("order", rf"\b(?!(?:{EITHER_ORDER})\()\w+\((\w+, \w+)\)", turned(", "),
            ("x = Less(a, b);", "x = Less(b, a);")),
    Pattern("choice", r" \? ([\w.]+ : [\w.]+)", turned(" : "), ("x = is ? a : b;", "x = is ? b : a;")),
    Pattern("condition", rf"\b(?:if|while) \(({NESTED})\)", negated,
            ("if (a(x) < b) c();", "if (!(a(x) < b)) c();")),
    Pattern("negation", r"(?<![\w)\]])(!)(?=[\w(])", without, ("return !IsYUV(x);", "return IsYUV(x);")),
    Pattern("truth", r"\bWORD\b", exchanged("true false"), ("bool x = true;", "bool x = false;")),
    Pattern("branch", r"^ *(if \(.*\) .*;) *$", empty, ("    if (a < b) return c;", "    ;")),
    Pattern("statement", rf"^ +((?:{PLACE}(?:\({NESTED}\)|\(\)| [-+*/&|^]?= .*)|(?:\+\+|--)\w+);) *$", empty,
            ("    Finish(row);", "    ;")),
    Pattern("result", r"\bWORD\b",
            {"PK_Success": "PK_ErrFailed", "PK_ErrFailed": "PK_ErrNotSupported"}
            | dict.fromkeys(("PK_ErrBadSrcFormat", "PK_ErrBadDstFormat", "PK_ErrNullSource", "PK_ErrNullDestination",
                             "PK_ErrSizeMismatch", "PK_ErrOutOfMemory", "PK_ErrBadFieldType", "PK_ErrNotSupported"),
                            "PK_ErrFailed"),
            ("return PK_Success;", "return PK_ErrFailed;")),
    Pattern("lock", r"^ +((?:const )?std::(?:lock_guard|scoped_lock)\b.*;) *$", empty,
            ("    const std::lock_guard lock(fMutex);", "    ;"), step="threads"),
    Pattern("memory order", r"\bmemory_order_(acquire|release|acq_rel|seq_cst)\b", lambda _: ["relaxed"],
            ("x.load(std::memory_order_acquire);", "x.load(std::memory_order_relaxed);"), step="threads"),
]
