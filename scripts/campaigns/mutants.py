"""The places of a C++ source where a small change is worth a try, and the source with all of these changes built in,
each behind a number that is chosen when the program starts (mutants.h).

The sources are read as a row of tokens. That suffices because their layout is that of clang-format: a binary operator
stands between blanks, the "<" of a template doesn't.
"""

import bisect
import re

TOKEN = re.compile(r"""
    (?P<blank>\s+|//[^\n]*|/\*.*?\*/)
  | (?P<directive>(?<![^\n])[ \t]*\#(?:\\\n|[^\n])*)
  | (?P<text>(?:u8|u|U|L)?(?:R"(?P<mark>[^(\s]*)\(.*?\)(?P=mark)"|"(?:\\.|[^"\\\n])*"|'(?:\\.|[^'\\\n])+'))
  | (?P<number>\.?\d(?:[\w.]|'(?=\w))*)
  | (?P<word>[A-Za-z_]\w*)
  | (?P<sign>->\*?|\+\+|--|<=>|<<=|(?<=\s)>>=?|(?<=\s)>=|<<|<=|==|!=|&&|\|\||[-+*/%&|^]=|::|\.\.\.|.)
""", re.VERBOSE | re.DOTALL)

# The binary operators that are changed: how tightly they bind, what they become, and what the call in mutants.h is.
BINARY = {
    "*": (10, "+", "Times"), "/": (10, "*", "Over"), "%": (10, "/", "Rest"),
    "+": (9, "-", "Plus"), "-": (9, "+", "Minus"), "<<": (8, ">>", "Left"), ">>": (8, "<<", "Right"),
    "<": (6, "<=", "Less"), "<=": (6, "<", "LessOrEqual"), ">": (6, ">=", "Greater"), ">=": (6, ">", "GreaterOrEqual"),
    "==": (5, "!=", "Equal"), "!=": (5, "==", "NotEqual"), "&": (4, "|", "And"), "^": (3, "&", "Either"),
    "|": (2, "&", "Or"), "&&": (1, "||", ""), "||": (0, "&&", ""),
}
ASSIGNMENTS = {"+=": ("-=", "Add"), "-=": ("+=", "Subtract"), "*=": ("+=", "Multiply"), "/=": ("*=", "Divide"),
               "|=": ("&=", "Join"), "&=": ("|=", "Mask"), "^=": ("|=", "Flip"), "<<=": (">>=", "ShiftLeft"),
               ">>=": ("<<=", "ShiftRight")}
# Where an operand ends, whatever the operator.
LIMITS = {";", ",", "?", ":", "=", "{", *ASSIGNMENTS}
LIMITING_WORDS = {"return", "throw", "case", "else", "do", "co_return", "co_yield"}
PAIRS = {")": "(", "]": "[", "}": "{"}
# What begins a statement in which the compiler works out all there is, or that declares.
CONSTANT = {"constexpr", "consteval", "constinit", "static_assert", "enum", "using", "typedef", "case", "template",
            "static", "friend", "operator", "concept", "requires"}
# What stands in the parentheses behind these is worked out by the compiler.
UNEVALUATED = {"noexcept", "decltype", "sizeof", "alignof", "alignas", "explicit", "requires", "constexpr",
               "static_assert"}


class Token:
    def __init__(self, kind, text, begin):
        self.kind = kind
        self.text = text
        self.begin = begin
        self.end = begin + len(text)
        self.partner = None   # The index of the bracket that belongs to this one.
        self.isAngle = False  # The "<" or ">" of a template.
        self.isFixed = False  # Where nothing is to be changed.


class Mutant:
    """A change: what is written over with what, so that it can be chosen by number, and how it is shown."""

    def __init__(self, kind, old, new, at, begin, end, edits):
        self.kind = kind
        self.old = old
        self.new = new
        self.at = at        # The offset of what is changed.
        self.begin = begin  # What the edits reach over.
        self.end = end
        self.edits = edits  # (offset, end, text with {n} for the number)
        self.number = None
        self.name = None
        self.line = None
        self.path = None
        self.isAlive = True  # It compiles.


def Tokens(source):
    tokens = []
    for match in TOKEN.finditer(source):
        if match.lastgroup not in ("blank", "directive") and match.group("blank") is None:
            kind = "text" if match.group("text") else match.lastgroup
            tokens.append(Token(kind, match.group(), match.start()))
    return tokens


def Pair(tokens):
    """Finds the partners of brackets, those of templates included."""
    open_ = []
    for index, token in enumerate(tokens):
        if token.kind != "sign":
            continue
        before = tokens[index - 1] if index else None
        if token.text in "([{":
            open_.append(index)
        elif token.text in PAIRS:
            while open_ and tokens[open_[-1]].text == "<":
                tokens[open_.pop()].isAngle = False
            if open_:
                token.partner = open_[-1]
                tokens[open_.pop()].partner = index
        elif token.text == "<" and before and before.text != "operator" and (before.text in ("template", "]") or
                                                                        before.end == token.begin):
            token.isAngle = True
            open_.append(index)
        elif token.text == ">" and open_ and tokens[open_[-1]].text == "<":
            token.isAngle = True
            token.partner = open_[-1]
            tokens[open_.pop()].partner = index


def Fix(tokens, begin, end):
    for token in tokens[begin:end]:
        token.isFixed = True


class Scope:
    """What an open brace stands for while the tokens are gone through."""

    def __init__(self, kind, isFixed, start):
        self.kind = kind        # "namespace", "class", "enum", "code", "values"
        self.isFixed = isFixed
        self.start = start      # Of the present statement.
        self.depth = 0          # Of parentheses.


def KindOfBlock(tokens, start, index, outer):
    """What begins with the "{" at `index`, in the statement that began at `start`."""
    words = [token.text for token in tokens[start:index]]
    before = tokens[index - 1].text if index else ""
    if outer == "code":
        return "values" if before == "=" else "code"
    if "enum" in words:
        return "enum"
    if "namespace" in words or (words[:1] == ["extern"] and "(" not in words):
        return "namespace"
    hasParameters = before in (")", "const", "noexcept", "override", "final", "}", "try") or "->" in words
    if hasParameters and "(" in words and not (before == "final" and {"class", "struct"} & set(words)):
        return "code"
    if {"class", "struct", "union"} & set(words) and before != "=":
        return "class"
    return "code" if "(" in words and before != "=" and ":" not in words else "values"


def FixConstants(tokens):
    """Marks what only the compiler works out, and what is no code."""
    scopes = [Scope("namespace", False, 0)]
    for index, token in enumerate(tokens):
        scope = scopes[-1]
        statement = tokens[scope.start:index]
        token.isFixed = token.isFixed or scope.isFixed or (
            scope.kind in ("namespace", "enum") or any(each.text in CONSTANT for each in statement))
        if scope.kind == "class" and token.kind == "number" and index > 1 and tokens[index - 1].text in ("=", ":"):
            token.isFixed = token.isFixed or tokens[index - 1].text == ":" or tokens[index - 2].text in (
                ")", "const", "noexcept", "override")
        if token.text in UNEVALUATED and index + 1 < len(tokens) and tokens[index + 1].partner and (
                tokens[index + 1].text == "(" or token.text == "requires"):
            Fix(tokens, index, tokens[index + 1].partner + 1)
        if token.isAngle and token.text == "<" and token.partner:
            Fix(tokens, index, token.partner + 1)
        if token.text == "[" and token.partner and (tokens[index + 1].text == "[" or (
                index > 1 and tokens[index - 1].kind == "word" and tokens[index - 2].end < tokens[index - 1].begin and
                (tokens[index - 2].kind == "word" or tokens[index - 2].isAngle) and
                tokens[index - 2].text not in LIMITING_WORDS)):
            Fix(tokens, index, token.partner + 1)
        if token.kind != "sign":
            continue
        if token.text == "{":
            kind = KindOfBlock(tokens, scope.start, index, scope.kind)
            isConstant = kind in ("values", "enum") and (scope.kind == "namespace" or token.isFixed)
            isLambdaOfConstant = scope.isFixed and kind == "code"
            scopes.append(Scope(kind, isConstant or isLambdaOfConstant, index + 1))
        elif token.text == "}" and len(scopes) > 1:
            done = scopes.pop()
            isExpression = done.kind == "values" or scopes[-1].depth > 0
            if not isExpression:
                scopes[-1].start = index + 1
        elif token.text in "([":
            scope.depth += 1
        elif token.text in ")]":
            scope.depth -= 1
        elif token.text == ";" and scope.depth <= 0:
            scope.start = index + 1
        elif token.text == ":" and scope.depth <= 0 and tokens[scope.start].text in ("case", "default", "public",
                                                                                    "private", "protected"):
            scope.start = index + 1


def IsBinary(tokens, index, source):
    """Whether the token is an operator between blanks."""
    token = tokens[index]
    return (token.kind == "sign" and not token.isAngle and 0 < index < len(tokens) - 1 and
            tokens[index - 1].text != "operator" and source[token.begin - 1].isspace() and
            source[token.end:token.end + 1].isspace())


def LeftOperand(tokens, index, tightness, source):
    """The index of the first token of what stands on the left of an operator."""
    at = index
    while at > 0:
        token = tokens[at - 1]
        if token.partner is not None and (token.text in PAIRS or (token.isAngle and token.text == ">")):
            if token.text == "}" and at != index and (tokens[at].kind != "sign" or tokens[at].text in "(!"):
                break
            at = token.partner
            continue
        if token.text in "([" and token.kind == "sign" or token.text in LIMITS or token.text in LIMITING_WORDS:
            break
        if token.text in BINARY and IsBinary(tokens, at - 1, source) and BINARY[token.text][0] < tightness:
            break
        at -= 1
    return at


def RightOperand(tokens, index, tightness, source):
    """The index behind the last token of what stands on the right of an operator."""
    at = index + 1
    while at < len(tokens):
        token = tokens[at]
        if token.partner is not None and (token.text in "([{" or (token.isAngle and token.text == "<")):
            at = token.partner + 1
            continue
        if token.text in PAIRS or token.text in LIMITS - {"{"}:
            break
        if token.text in BINARY and IsBinary(tokens, at, source) and BINARY[token.text][0] <= tightness:
            break
        at += 1
    return at


def OperandOfPrefix(tokens, index):
    """The index behind the operand of "!", "++" or "--" at `index`."""
    at = index + 1
    while tokens[at].text in ("*", "!", "-", "&", "~", "++", "--"):
        at += 1
    at = tokens[at].partner + 1 if tokens[at].text == "(" else at + 1
    while at < len(tokens):
        token = tokens[at]
        if token.partner is not None and (token.text in "([" or (token.isAngle and token.text == "<")):
            at = token.partner + 1
        elif token.text in (".", "->", "::"):
            at += 2
        elif token.text == "{" and tokens[at - 1].end == token.begin:
            at = token.partner + 1
        else:
            break
    return at


class Source:
    """What can be changed in one source."""

    def __init__(self, path, text):
        self.path = path
        self.text = text
        self.tokens = Tokens(text)
        Pair(self.tokens)
        FixConstants(self.tokens)
        self.mutants = []
        for index, token in enumerate(self.tokens):
            if not token.isFixed:
                self.Consider(index, token)
        self.Name()

    def Add(self, kind, token, new, begin, end, edits, old=None):
        mutant = Mutant(kind, old or token.text, new, token.begin, begin, end, edits)
        mutant.path = self.path
        self.mutants.append(mutant)

    def Consider(self, index, token):
        if token.kind == "number":
            self.AddNumber(token)
        elif token.kind == "word":
            self.ConsiderWord(index, token)
        elif token.text in BINARY and IsBinary(self.tokens, index, self.text):
            self.AddBinary(index, token)
        elif token.text in ASSIGNMENTS:
            self.AddAssignment(index, token)
        elif token.text == "!":
            end = self.tokens[OperandOfPrefix(self.tokens, index) - 1].end
            self.Add("not", token, "", token.begin, end, [(token.begin, token.end, "(mutants::Is({n}) != !"),
                                                          (end, end, ")")])
        elif token.text in ("++", "--"):
            self.AddStep(index, token)

    def AddNumber(self, token):
        """0 and 1 become each other, other integers one more or one less."""
        match = re.fullmatch(r"(0[xX][\da-fA-F']+|0[bB][01']+|[\d']+)([uUlLzZ]*)", token.text)
        if not match:
            return
        value = int(match.group(1).replace("'", ""), 0 if match.group(1)[:2] in ("0x", "0X", "0b", "0B") else 10)
        less = value > 1 and (token.begin + value) % 2 == 0
        new = 1 - value if value < 2 else value - 1 if less else value + 1
        shown = (hex(new) if match.group(1)[:2] in ("0x", "0X") else str(new)) + match.group(2)
        self.Add("constant", token, shown, token.begin, token.end,
                 [(token.begin, token.end, f"(mutants::Is({{n}}) ? {shown} : {token.text})")])

    def ConsiderWord(self, index, token):
        following = self.tokens[index + 1] if index + 1 < len(self.tokens) else token
        if token.text in ("true", "false"):
            other = "false" if token.text == "true" else "true"
            self.Add("constant", token, other, token.begin, token.end,
                     [(token.begin, token.end, f"(mutants::Is({{n}}) != {token.text})")])
        elif token.text == "if" and following.text == "(" and following.partner:
            self.AddGuard(index, token)
        elif token.text in ("return", "break", "continue") and following.text == ";":
            self.Add("end", token, "", token.begin, following.end,
                     [(token.begin, token.begin, "if (!mutants::Is({n})) ")], token.text + ";")
            if token.text == "continue":
                self.Add("end", token, "break;", token.begin, following.end,
                         [(token.begin, token.begin, "if (mutants::Is({n})) break; else ")], "continue;")
        elif token.text == "return":
            self.AddResult(index, token)

    def AddGuard(self, index, token):
        """Lets the branch of an "if" never be taken."""
        begin = index + 2
        end = self.tokens[index + 1].partner
        at = begin
        while at < end:
            each = self.tokens[at]
            if each.partner is not None and each.partner > at:
                at = each.partner
            elif each.text == ";":
                begin = at + 1
            elif each.text == "=" and begin <= at:
                return  # A declaration: what it is about is used in what follows.
            at += 1
        first, last = self.tokens[begin].begin, self.tokens[end].begin
        self.Add("guard", token, "if (false)", first, last,
                 [(first, first, "!mutants::Is({n}) && ("), (last, last, ")")])

    def AddResult(self, index, token):
        """Lets a function give another number, the opposite, or null. Other types don't compile and are left out."""
        end = RightOperand(self.tokens, index, -1, self.text)
        while self.tokens[end].text in ("?", ":", ","):
            end = RightOperand(self.tokens, end, -1, self.text)
        first = self.tokens[index + 1]
        isPlain = end == index + 2 and (first.kind in ("number", "text") or first.text in ("true", "false", "nullptr",
                                                                                          "this"))
        if self.tokens[end].text != ";" or isPlain or first.text in ("{", "*"):
            return
        last = self.tokens[end - 1].end
        self.Add("result", token, "return another", first.begin, last,
                 [(first.begin, first.begin, "mutants::Another({n}, "), (last, last, ")")])

    def AddBinary(self, index, token):
        tightness, new, name = BINARY[token.text]
        first = LeftOperand(self.tokens, index, tightness, self.text)
        last = RightOperand(self.tokens, index, tightness, self.text)
        if first == index or last == index + 1:
            return
        # Texts can be joined, but not taken away.
        if name == "Plus" and any(each.kind == "text" and each.text[-1] == '"' for each in self.tokens[first:last]):
            return
        begin, end = self.tokens[first].begin, self.tokens[last - 1].end
        if name:
            edits = [(begin, begin, f"mutants::{name}({{n}}, ("), (token.begin, token.end, "), ("), (end, end, "))")]
        else:  # By what De Morgan says of them, so that the right side is worked out when it would be.
            chosen = ") != mutants::Is({n}))"
            edits = [(begin, begin, "(((bool("), (token.begin, token.end, f"{chosen} {token.text} (bool("),
                     (end, end, chosen + ") != mutants::Is({n}))")]
        self.Add("operator", token, new, begin, end, edits)

    def AddAssignment(self, index, token):
        new, name = ASSIGNMENTS[token.text]
        first = LeftOperand(self.tokens, index, -1, self.text)
        last = RightOperand(self.tokens, index, -1, self.text)
        while self.tokens[last].text in ("?", ":"):
            last = RightOperand(self.tokens, last, -1, self.text)
        begin, end = self.tokens[first].begin, self.tokens[last - 1].end
        if any(each.kind == "text" and each.text[-1] == '"' for each in self.tokens[index:last]):
            return
        self.Add("operator", token, new, begin, end,
                 [(begin, begin, f"mutants::{name}({{n}}, ("), (token.begin, token.end, "), ("), (end, end, "))")])

    def AddStep(self, index, token):
        new = "--" if token.text == "++" else "++"
        name = "Up" if token.text == "++" else "Down"
        before = self.tokens[index - 1]
        if before.end == token.begin and (before.kind == "word" or before.text in ")]"):
            first = index - 1
            while self.tokens[first].text in (")", "]") or self.tokens[first - 1].text in (".", "->", "::"):
                if self.tokens[first].text in (")", "]"):
                    first = self.tokens[first].partner - 1
                elif self.tokens[first - 1].text in (".", "->", "::"):
                    first -= 2
            begin = self.tokens[first].begin
            edits = [(begin, begin, f"mutants::{name}After({{n}}, "), (token.begin, token.end, ")")]
            self.Add("operator", token, new, begin, token.end, edits)
        else:
            end = self.tokens[OperandOfPrefix(self.tokens, index) - 1].end
            edits = [(token.begin, token.end, f"mutants::{name}({{n}}, "), (end, end, ")")]
            self.Add("operator", token, new, token.begin, end, edits)

    def Name(self):
        """Names each change by its line with the change in it; a number tells equal ones of a file apart."""
        lines = self.text.splitlines()
        starts = [0]
        for line in self.text.splitlines(keepends=True):
            starts.append(starts[-1] + len(line))
        counts = {}
        for mutant in self.mutants:
            mutant.line = bisect.bisect_right(starts, mutant.at)
            line = lines[mutant.line - 1]
            at = mutant.at - starts[mutant.line - 1]
            shown = f"{line[:at]}«{mutant.old} -> {mutant.new}»{line[at + len(mutant.old):]}".strip()
            counts[shown] = counts.get(shown, 0) + 1
            mutant.name = f"{self.path}: {shown}" + (f" ({counts[shown]})" if counts[shown] > 1 else "")

    def With(self, mutants):
        """The text with these changes built in, and for each of its lines (begin, end, mutant) by column."""
        edits = []
        for order, mutant in enumerate(mutants):
            size = mutant.end - mutant.begin
            for begin, end, text in mutant.edits:
                # At one place what closes comes first, the inner before the outer, then what opens, the outer first.
                isClose = begin == end == mutant.end
                rank = (0, size, -order) if isClose else (1, -size, order) if begin == end else (1, 0, 0)
                edits.append((begin, rank, end, text.replace("{n}", str(mutant.number)), mutant))
        edits.sort(key=lambda edit: edit[:2])
        pieces = []
        spans = []
        done = size = 0
        for begin, _, end, text, mutant in edits:
            pieces += [self.text[done:begin], text]
            size += begin - done
            spans.append((size, size + len(text), mutant))
            size += len(text)
            done = end
        pieces.append(self.text[done:])
        return "".join(pieces), spans
