"""The changes that scripts/mutate can make to C++ sources, one at a time.

The sources are taken as clang-format leaves them: blanks around every binary operator, none inside
the brackets of a template, braces around every body.
"""

import collections
import hashlib
import random
import re

# `before` at `offset` of `path` becomes `after`; `line` and the two whole lines are for the reader.
Mutation = collections.namedtuple(
    'Mutation', 'ident path offset line kind before after old_line new_line')

# How often a kind is drawn, in relation to the others.
WEIGHTS = {'statement': 25, 'condition': 20, 'comparison': 15, 'constant': 15, 'return': 10,
           'logic': 8, 'negation': 8, 'arithmetic': 6, 'bool': 5, 'string': 5}

COMPARISONS = {'==': ['!='], '!=': ['=='], '<': ['<=', '>='], '<=': ['<', '>'],
               '>': ['>=', '<='], '>=': ['>', '<']}
ARITHMETIC = {' + ': ' - ', ' - ': ' + ', ' += ': ' -= ', ' -= ': ' += ', '++': '--', '--': '++'}

LEXEME = re.compile(r'''(?P<comment>//[^\n]*|/\*.*?\*/)
    |(?P<directive>^[ \t]*\#(?:[^\n\\]|\\.)*)
    |(?P<raw>R"(?P<mark>[^(]*)\(.*?\)(?P=mark)")
    |(?P<string>"(?:[^"\\\n]|\\.)*")
    |(?P<character>'(?:[^'\\\n]|\\.)+')''', re.S | re.M | re.X)

# A call, an assignment, a step, or the end of a way through the code; no declaration.
STATEMENT = re.compile(
    r'(?:(?:return|break|continue)$|(?:throw|delete)\b|(?:\+\+|--)\w'
    r'|(?!(?:return|using|typedef|case|default|else|while|static_assert)\b)'
    r'[*(]*[\w:]+(?:(?:\.|->|::)~?\w+|\[[^\]]*\]|<[^;()<>]*>|\([^;{}]*?\))*\)?'
    r'\s*(?:\(|[-+|&*]?=[^=]|\+\+|--|$))', re.S)


def masked(text):
    """The text with comments, directives and the inside of literals blanked; and the literals."""
    literals = []

    def blank(match):
        kind, found = match.lastgroup, match.group()
        if kind in ('mark', 'raw'):
            return '"' + re.sub(r'[^\n]', '_', found[1:-1]) + '"'
        if kind in ('string', 'character'):
            literals.append((match.start(), kind, found))
            return found[0] + '_' * (len(found) - 2) + found[0]
        return re.sub(r'[^\n]', ' ', found)

    return LEXEME.sub(blank, text), literals


def code_places(text):
    """For every place of a masked text, whether it lies in the body of a function."""
    inside, stack, chunk = bytearray(len(text)), [], 0
    for place, letter in enumerate(text):
        inside[place] = bool(stack) and stack[-1]
        if letter == '{':
            head = text[chunk:place].strip()
            is_type = re.search(r'\b(namespace|class|struct|union|enum)\b[^()]*$', head)
            is_list = re.search(r'[=,(<\w]$', head) and not re.search(
                r'\b(const|noexcept|override|final|else|do|try|mutable)$', head)
            in_code = bool(stack) and stack[-1]
            stack.append((in_code and not is_list) or
                         (not is_type and not is_list and ')' in head))
        elif letter == '}' and stack:
            stack.pop()
        if letter in ';{}':
            chunk = place + 1
    return inside


def closing(text, place):
    """The place of the parenthesis that closes the one at `place`."""
    depth = 0
    for at in range(place, len(text)):
        depth += {'(': 1, ')': -1}.get(text[at], 0)
        if depth == 0:
            return at
    return -1


def statements(text, inside):
    start, depth = 0, 0
    for place, letter in enumerate(text):
        depth += {'(': 1, ')': -1}.get(letter, 0)
        if letter in '{}' or (letter == ';' and depth == 0):
            if letter == ';' and inside[place]:
                lead = re.match(r'\s*(?:(?:case\b[^:]*(?:::[^:]*)*|default):\s)*\s*',
                                text[start:place], re.S).end()
                if STATEMENT.match(text[start + lead:place]):
                    yield start + lead, place + 1
            start, depth = place + 1, 0


def literal_changes(literals):
    for start, kind, found in literals:
        if kind == 'string':
            yield start, found, found[:-1] + 'x"', 'string'
        else:
            other = "'x'" if found != "'x'" else "'y'"
            yield start, found, other, 'constant'


def conditions(text, source, inside):
    for match in re.finditer(r'\b(if|while) \(', text):
        begin = match.end() - 1
        end = closing(text, begin)
        condition = source[begin + 1:end]
        if not inside[begin] or end < 0 or ';' in text[begin:end] or \
                re.match(r'(const|auto)\b|[\w:<>*& ]+ = ', text[begin + 1:end]):
            continue
        yield begin + 1, condition, '(' + condition + ') && false', 'condition'
        if match.group(1) == 'if':
            yield begin + 1, condition, '(' + condition + ') || true', 'condition'


def returns(text, source, inside):
    for match in re.finditer(r'\breturn ([^;]+);', text):
        if not inside[match.start()]:
            continue
        value = source[match.start(1):match.end(1)]
        if re.search(r' (==|!=|<|>|<=|>=|&&|\|\|) |^!', match.group(1)):
            yield match.start(1), value, '!(' + value + ')', 'return'
        elif match.group(1) not in ('true', 'false', 'nullptr', '{}'):
            yield match.start(1), value, '{}', 'return'


def changes(source):
    """Yields (offset, before, after, kind) for every change that can be made to a source."""
    text, literals = masked(source)
    inside = code_places(text)
    yield from literal_changes(literals)
    yield from conditions(text, source, inside)
    yield from returns(text, source, inside)
    for begin, end in statements(text, inside):
        yield begin, source[begin:end], ';', 'statement'
    for match in re.finditer(r'(?<= )([=!<>]=|[<>])(?=\s)', text):
        if inside[match.start()]:
            for other in COMPARISONS[match.group()]:
                yield match.start(), match.group(), other, 'comparison'
    for match in re.finditer(r'(?<=\s)(&&|\|\|)(?=\s)', text):
        yield match.start(), match.group(), '||' if match.group() == '&&' else '&&', 'logic'
    for match in re.finditer(r'!(?=[\w(*:])', text):
        yield match.start(), '!', '', 'negation'
    for match in re.finditer(r' [-+]=? |(?:\+\+|--)(?=\w)|(?<=\w)(?:\+\+|--)', text):
        if inside[match.start()]:
            yield match.start(), match.group(), ARITHMETIC[match.group()], 'arithmetic'
    for match in re.finditer(r'\b(true|false)\b', text):
        yield match.start(), match.group(), 'false' if match.group() == 'true' else 'true', 'bool'
    for match in re.finditer(r'(?<![\w.\'])(0x[0-9a-fA-F]+|\d+)(?=[uUlL]*(?![\w.]))', text):
        number = int(match.group(), 0 if match.group().startswith('0x') else 10)
        for other in (number + 1, number - 1):
            if other >= 0:
                yield match.start(), match.group(), str(other), 'constant'


def line_at(source, offset):
    return ' '.join(source[source.rfind('\n', 0, offset) + 1:].split('\n', 1)[0].split())


def mutations_of(path, source):
    seen = collections.Counter()
    for offset, before, after, kind in changes(source):
        changed = source[:offset] + after + source[offset + len(before):]
        old_line, new_line = line_at(source, offset), line_at(changed, offset)
        key = (path, kind, old_line, new_line, before, after)
        seen[key] += 1
        ident = hashlib.sha1(repr((key, seen[key])).encode()).hexdigest()[:10]
        yield Mutation(ident, path, offset, source.count('\n', 0, offset) + 1, kind, before, after,
                       old_line, new_line)


def drawn(mutations, seed):
    """All of them in an order drawn at random: first a kind by its weight, then one of the kind."""
    rng = random.Random(seed)
    kinds = collections.defaultdict(list)
    for mutation in mutations:
        kinds[mutation.kind].append(mutation)
    while kinds:
        names = sorted(kinds)
        name = rng.choices(names, [WEIGHTS[kind] for kind in names])[0]
        yield kinds[name].pop(rng.randrange(len(kinds[name])))
        if not kinds[name]:
            del kinds[name]
