"""Small changes to a C++ source: where they can be made, and how the text reads afterwards.

Leans on the layout that clang-format gives: an operator with two operands stands between spaces, a pointer's star
and a template's brackets do not. Comments, texts, preprocessor lines and static assertions are left alone.
"""
import dataclasses
import re

COMPARISONS = {"<": ("<=", ">="), "<=": ("<", ">"), ">": (">=", "<="), ">=": (">", "<"), "==": ("!=",), "!=": ("==",)}
ARITHMETIC = {"+": "-", "-": "+", "*": "/", "/": "*", "%": "*", "<<": ">>", ">>": "<<", "&": "|", "|": "&", "^": "|",
              "&&": "||", "||": "&&", "+=": "-=", "-=": "+=", "*=": "/=", "/=": "*=", "%=": "*=", "&=": "|=",
              "|=": "&=", "^=": "|=", "<<=": ">>=", ">>=": "<<="}
OPERATOR = re.compile(r"(?<=\s)(<=>|<<=|>>=|[-+*/%&|^]=|&&|\|\||<<|>>|[<>=!]=|[-+*/%&|^<>])(?=\s)")
STEP = re.compile(r"\+\+|--")
NUMBER = re.compile(r"(?<![\w.'])(0[xX][0-9a-fA-F']+|\d[\d']*\.?\d*(?:[eE][-+]?\d+)?)([uUlLfFzZ]*)(?![\w.'])")
CONDITION = re.compile(r"\b(?:if|while)( constexpr)? \(")
STATEMENT = re.compile(r"(?<=[{};:)])\s+((?:\*|\+\+|--)?[A-Za-z_][^;{}]*;)")
KEYWORDS = re.compile(r"(?:return|using|static|constexpr|const|namespace|template|typedef|struct|class|enum|friend|"
                      r"case|default|public|private|extern|goto|throw|else|for|if|while|do|switch|alignas)\b")
EFFECT = re.compile(r"(?:break|continue);|[^\s(=]+\s(?:[-+*/%&|^]|<<|>>)?= |[\w:.>\[\]*()-]+(?:\+\+|--);|"
                    r"[\w:.>\[\]<-]+\(")
CALL = re.compile(r"\b[A-Za-z_]\w*(?:<[^<>();]*>)?\(")
DECLARED = re.compile(r"^(?:const\b|\[\[)|^[\w:<>,]+(?:[*&]+)? [*&]*[A-Za-z_]\w*(?:\[\w*\])?(?: = .*)?$|"
                      r"^[\w:]+[*&]+$|^$")
HIDDEN = re.compile(r"""
    //[^\n]* | /\*.*?\*/ | R"\((?s:.*?)\)" | (?:u8|u|U|L)?"(?:\\.|[^"\\\n])*"
    | (?<![0-9a-fA-F])(?:u8|u|U|L)?'(?:\\.|[^'\\\n])+'
    | ^[ \t]*\#(?:[^\n]*\\\n)*[^\n]* | \bstatic_assert\((?s:.*?)\);""", re.VERBOSE | re.MULTILINE)


@dataclasses.dataclass(frozen=True)
class Mutation:
    file: str  # from the project's root
    begin: int
    end: int
    text: str  # what takes the place of [begin, end)
    kind: str
    line: int
    before: str  # the lines that are touched, blanks folded
    after: str

    def apply(self, source):
        return source[:self.begin] + self.text + source[self.end:]

    @property
    def key(self):
        return self.file, self.before, self.after


def closing(code, opening):
    """The index of the bracket that closes the one at opening."""
    depth = 0
    for i in range(opening, len(code)):
        depth += code[i] in "([{"
        depth -= code[i] in ")]}"
        if depth == 0:
            return i
    return len(code) - 1


def arguments(code, opening):
    """[(begin, end), ...] of what stands between commas at the top level."""
    parts, depth, begin, close = [], 0, opening + 1, closing(code, opening)
    for i in range(opening + 1, close + 1):
        if (code[i] == "," and depth == 0) or i == close:
            parts.append((begin, i))
            begin = i + 1
        depth += code[i] in "([{"
        depth -= code[i] in ")]}"
    stripped = []
    for first, last in parts:
        text = code[first:last]
        stripped.append((first + len(text) - len(text.lstrip()), last - len(text) + len(text.rstrip())))
    return stripped


def other_numbers(text, suffix):
    """The constant one larger and one smaller; of a number with a fraction, in its last digit."""
    plain = text.replace("'", "")
    if plain[:2] in ("0x", "0X"):
        value = int(plain, 16)
        return [f"{value + 1:#x}{suffix}"] + ([f"{value - 1:#x}{suffix}"] if value else [])
    if plain.isdigit():
        value = int(plain, 8) if len(plain) > 1 and plain[0] == "0" else int(plain)
        return [f"{value + 1}{suffix}"] + ([f"{value - 1}{suffix}"] if value else [])
    digits, power, exponent = re.fullmatch(r"([\d.]+)([eE]?)(.*)", plain).groups()
    place = len(digits) - 1 if digits[-1] != "." else len(digits) - 2
    digit = int(digits[place])
    return [digits[:place] + str(digit + 1 if digit < 9 else 8) + digits[place + 1:] + power + exponent + suffix]


def edits(source):
    """(begin, end, text, kind) of every change that can be made."""
    code = HIDDEN.sub(lambda m: re.sub(r"[^\n]", "\x01", m[0]), source)
    for match in OPERATOR.finditer(code):
        operator = match[0]
        if code[:match.start()].rstrip().endswith("operator") or code[match.end():].lstrip().startswith((")", ",")):
            continue
        for other in COMPARISONS.get(operator, ()):
            yield match.start(), match.end(), other, "comparison"
        if operator in ARITHMETIC and not re.search(r"= $|[(,\[]\s*$", code[:match.start()]):
            yield match.start(), match.end(), ARITHMETIC[operator], "operator"
    for match in STEP.finditer(code):
        yield match.start(), match.end(), "--" if match[0] == "++" else "++", "operator"
    for match in NUMBER.finditer(code):
        for other in other_numbers(match[1], match[2]):
            yield match.start(), match.end(), other, "constant"
    for match in CONDITION.finditer(code):
        begin, end = match.end(), closing(code, match.end() - 1)
        if ";" not in code[begin:end] and not DECLARED.match(code[begin:end]):
            yield begin, end, f"!({source[begin:end]})", "condition"
    for match in STATEMENT.finditer(code):
        statement = match[1]
        if KEYWORDS.match(statement) or re.match(r"[\w:]+:$", statement):
            continue
        if EFFECT.match(statement):
            yield match.start(1), match.end(1), ";", "dropped"
    for match in CALL.finditer(code):
        if re.match(r"(?:if|for|while|switch|return|sizeof|alignof|decltype|catch)\b", match[0]):
            continue
        parts = arguments(code, match.end() - 1)
        if len(parts) < 2 or any(DECLARED.match(" ".join(code[a:b].split())) for a, b in parts):
            continue
        for (a, b), (c, d) in zip(parts, parts[1:]):
            if source[a:b] != source[c:d]:
                yield a, d, source[c:d] + source[b:c] + source[a:b], "swapped"


def mutations(file, source):
    """Every change that can be made to this source, in the order of its text."""
    found = []
    for begin, end, text, kind in edits(source):
        first = source.rfind("\n", 0, begin) + 1
        last = source.find("\n", end)
        before = " ".join(source[first:last].split())
        after = " ".join((source[first:begin] + text + source[end:last]).split())
        found.append(Mutation(file, begin, end, text, kind, source.count("\n", 0, begin) + 1, before, after))
    return sorted(found, key=lambda m: (m.begin, m.end, m.text))
