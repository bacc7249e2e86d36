"""Line layout of the generated C++: calls wrapped under their parenthesis
and return statements wrapped at the column limit."""

import re

WIDTH = 120


def call(head, args, tail, indent):
    """head(args)tail on one line if it fits, else the arguments wrapped
    under the opening parenthesis."""
    one = '%s%s(%s)%s' % (' ' * indent, head, ', '.join(args), tail)
    if len(one) <= WIDTH:
        return [one]
    lines = []
    line = '%s%s(' % (' ' * indent, head)
    column = len(line)
    if column > WIDTH // 2:
        # Too far right to align under the parenthesis: a hanging indent.
        lines.append(line)
        column = len(head) - len(head.lstrip()) + indent + 4
        line = ' ' * column
    for i, arg in enumerate(args):
        piece = arg + (', ' if i + 1 < len(args) else ')' + tail)
        if len(line) + len(piece.rstrip()) > WIDTH and line.strip() and not line.endswith('('):
            lines.append(line.rstrip())
            line = ' ' * column
        line += piece
    lines.append(line)
    return lines


def returning(signature, terms, joiner):
    """A function whose body returns the terms joined by joiner."""
    one = '%s { return %s; }' % (signature, (joiner + ' ').join(terms))
    if len(one) <= WIDTH:
        return [one]
    out = [signature + ' {']
    line = '    return '
    for i, term in enumerate(terms):
        piece = term + (joiner if i + 1 < len(terms) else ';')
        if len(line) + len(piece) > WIDTH and line.strip() != 'return':
            out.append(line.rstrip())
            line = ' ' * 11
        line += piece + ' '
    out += [line.rstrip(), '}']
    return out


ONE_LINE_BODY = re.compile(r'^(\s*)(.*\S) \{ (.*) \}$')
BREAKS = ('; ', ', ', ' && ', ' || ', ' ? ', ' : ')


def fold(lines):
    """The lines with every one longer than WIDTH broken: a one-line function
    body goes on lines of its own, a long expression is broken after a comma
    or before an operator, continued under its opening parenthesis."""
    out = []
    for line in lines:
        out += fold_line(line)
    return out


def fold_line(line):
    if len(line) <= WIDTH:
        return [line]
    m = ONE_LINE_BODY.match(line)
    if m and '{' not in m.group(3):
        indent = m.group(1)
        return fold_line(indent + m.group(2) + ' {') + fold_line(indent + '    ' + m.group(3)) + [indent + '}']
    indent = len(line) - len(line.lstrip())
    # The weakest bond first: statements of a for, then && and ||, then
    # arguments, then the conditional operator.
    for breaks in (('; ',), (' && ', ' || '), (', ',), (' ? ', ' : ')):
        cut = max(line.rfind(b, 0, WIDTH - 1) for b in breaks)
        column = continuation_column(line, cut, indent)
        if cut > column:
            break
    else:
        return [line]
    head, tail = line[:cut], line[cut:]
    if tail.startswith((', ', '; ')):
        head, tail = head + tail[0], tail[2:]
    else:
        tail = tail[1:]
    return [head] + fold_line(' ' * column + tail)


def continuation_column(line, cut, indent):
    """Under the innermost parenthesis still open at cut, if that is not too
    far right; else a double indent."""
    opened = []
    for i, c in enumerate(line[:max(cut, 0)]):
        if c == '(':
            opened.append(i)
        elif c == ')' and opened:
            opened.pop()
    if opened and opened[-1] + 1 < WIDTH // 2:
        return opened[-1] + 1
    return indent + 8
