"""The description of a CxF3 group as read from its .schema file: the group,
its enumerations, its classes and their members, and the value shorthands.
"""

import os
import re


class DescriptionError(Exception):
    pass


# ---------------------------------------------------------------- values

class ValueKind:
    """A value shorthand of the tables: the C++ type, whether it is passed by
    value, the whitespace mode, the lexical and the value validator, and
    whether it is a list of such values in one text."""

    def __init__(self, word, cpp_type, pod, whitespace, lexical, value_check=None, is_list=False, enum=None):
        self.word = word
        self.cpp_type = cpp_type
        self.pod = pod
        self.whitespace = whitespace
        self.lexical = lexical
        self.value_check = value_check or 'lmx::value_validator_none<%s>' % cpp_type
        self.is_list = is_list
        self.enum = enum  # the Enumeration of an enumerated value

    @property
    def spec(self):
        return 'spec_' + word_identifier(self.word)

    def param(self):
        return '%s a_value' % self.cpp_type if self.pod else 'const %s &ar_value' % self.cpp_type

    def arg(self):
        return 'a_value' if self.pod else 'ar_value'

    def result(self):
        return self.cpp_type + ' ' if self.pod else 'const %s &' % self.cpp_type


def word_identifier(word):
    """A value word as part of a C++ name: double>=0<=1 gives double_ge0_le1."""
    name = word.replace('>=', '_ge').replace('<=', '_le').replace('>', '_gt')
    return re.sub('[^A-Za-z0-9_]', '_', name)


COLLAPSE = 'lmx::ws_collapse'
PRESERVE = 'lmx::ws_preserve'

# word: (C++ type, pod, whitespace, lexical validator)
SCALARS = {
    'string': ('std::wstring', False, PRESERVE, 'lmx::lexical_validator_none'),
    'string.nonempty': ('std::wstring', False, PRESERVE, 'lexical_nonempty'),
    'string.nonempty.max1': ('std::wstring', False, PRESERVE, 'lexical_nonempty_max1'),
    'string.collapse': ('std::wstring', False, COLLAPSE, 'lmx::lexical_validator_none'),
    'double': ('double', True, COLLAPSE, 'lmx::lexical_validator_float'),
    'short': ('short', True, COLLAPSE, 'lmx::lexical_validator_short'),
    'int': ('int', True, COLLAPSE, 'lmx::lexical_validator_int'),
    'ushort>=360<=400': ('unsigned short', True, COLLAPSE, 'lexical_ushort_360_400'),
    'boolean': ('bool', True, COLLAPSE, 'lmx::lexical_validator_bool'),
    'dateTime': ('lmx::c_datetime', False, COLLAPSE, 'lmx::lexical_validator_datetime'),
    'base64Binary': ('lmx::c_binary', False, COLLAPSE, 'lmx::lexical_validator_base64'),
    'bigint': ('lmx::c_big_int', False, COLLAPSE, 'lmx::lexical_validator_integer'),
}

# Bounded doubles: double>=0, double>0, double>=0<=100, ...
DOUBLE_BOUNDS = re.compile(r'^double(>=|>)(-?[0-9.]+)(?:<=(-?[0-9.]+))?$')


def double_bounds(word):
    """(minimum, exclusive, maximum) of a bounded double word, else None."""
    m = DOUBLE_BOUNDS.match(word)
    if not m:
        return None
    return m.group(2), m.group(1) == '>', m.group(3)


def value_kind(word, enums):
    is_list = word.startswith('list:')
    item = word[5:] if is_list else word
    if item in SCALARS:
        cpp_type, pod, whitespace, lexical = SCALARS[item]
        # A facet checked on the text is checked again on the value, so that
        # a value set through an accessor is refused on writing as well.
        value_check = 'value_' + lexical[len('lexical_'):] if not lexical.startswith('lmx::') else None
        kind = ValueKind(word, cpp_type, pod, whitespace, lexical, value_check)
    elif double_bounds(item):
        kind = ValueKind(word, 'double', True, COLLAPSE, 'lmx::lexical_validator_float',
                         'value_' + word_identifier(item))
    elif item in enums:
        kind = ValueKind(word, 'std::wstring', False, PRESERVE, 'lmx::lexical_validator_none',
                         'value_' + item, enum=enums[item])
    else:
        raise DescriptionError('unknown value %s' % word)
    if is_list:
        if not kind.pod:
            raise DescriptionError('a list holds plain values only: %s' % word)
        # The list reader splits the items; each item is then checked alone.
        kind.is_list = True
        kind.whitespace = PRESERVE
    return kind


# ---------------------------------------------------------------- the model

class Group:
    def __init__(self, prefix, uri, stem, ns_id, namespace):
        self.prefix = '' if prefix == '-' else prefix
        self.uri = uri
        self.stem = stem
        self.ns_id = ns_id
        # The C++ namespace of the classes ('' for the top level) and of the
        # group's tables and constants.
        self.class_namespace = '' if namespace.startswith('-') else namespace
        self.table_namespace = namespace.lstrip('-') or namespace

    def element(self, local):
        return '%s:%s' % (self.prefix, local) if self.prefix else local


class Enumeration:
    def __init__(self, name, texts, line):
        self.name = name
        self.texts = texts  # in number order, from 1
        self.line = line

    def constant(self, text):
        return '%s_%s' % (self.name, re.sub('[^A-Za-z0-9]', '_', text))


OCCURS = re.compile(r'^(0|1)\.\.(n|[0-9]+)$|^1$')


def occurs(word):
    if not OCCURS.match(word):
        raise DescriptionError('occurs must be 1, 0..1, 0..n, 1..n or 0..<max>: %s' % word)
    if word == '1':
        return 1, 1
    low, high = word.split('..')
    return int(low), None if high == 'n' else int(high)


class Member:
    """An attribute, a child element or a group of a class, or an
    alternative of a choice."""

    def __init__(self, kind, name, content, bounds, line, note):
        self.kind = kind  # 'attr', 'elem', 'group' or 'alt'
        self.name = name  # local name; for a group, its class
        self.content = content  # ValueKind, or the name of a class of the group
        self.min, self.max = bounds
        self.line = line
        self.note = note  # the row, as a comment for the accessors
        self.chosen = None  # the chosen number of an alternative
        self.map_index = None  # the row of an element in its class's event table

    @property
    def is_complex(self):
        return isinstance(self.content, str)

    @property
    def is_any(self):
        return self.content == '<any>'

    @property
    def required(self):
        return self.min > 0

    @property
    def repeated(self):
        return self.max is None or self.max > 1

    def container(self):
        if self.is_any:
            return 'lmx::ct_simple_non_pod_single<lmx::c_any_info>'
        if self.is_complex:
            if self.repeated:
                return 'lmx::ct_complex_multi<%s>' % self.content
            return 'lmx::ct_complex_%s<%s>' % ('single' if self.required else 'optional', self.content)
        if self.repeated:
            raise DescriptionError('line %d: a repeated element of plain value is not supported' % self.line)
        v = self.content
        if v.is_list:
            return 'lmx::ct_simple_pod_list_%s<%s>' % ('single' if self.required else 'optional', v.cpp_type)
        return 'lmx::ct_simple_%s_%s<%s>' % ('pod' if v.pod else 'non_pod', 'single' if self.required else 'optional',
                                              v.cpp_type)


CLASS_FLAGS = ('always-ok', 'nillable', 'any-attributes')


class Class:
    def __init__(self, name, kind, line):
        self.name = name
        self.kind = kind  # 'empty', 'complex', 'simple', 'derived' or 'choice'
        self.line = line
        self.attrs = []
        self.elems = []  # element and group rows, in table order
        self.alts = []  # alternatives of a choice
        self.body = None  # ValueKind of a simple class
        self.base = None  # base class of a derived class
        self.role = None  # of a choice: 'element', 'group' or 'document'
        self.repeat = False  # of a choice group: a repeating choice
        self.flags = set()
        self.members_file = None  # hand-written member declarations

    @property
    def local_name(self):
        return self.name[2:] if self.name.startswith('c_') else self.name

    @property
    def members(self):
        return self.attrs + self.elems

    @property
    def required_attrs(self):
        return [m for m in self.attrs if m.required]

    @property
    def element_rows(self):
        return [m for m in self.elems if m.kind == 'elem']

    @property
    def body_can_be_empty(self):
        return not any(e.required for e in self.elems)

    @property
    def is_group(self):
        return self.kind == 'choice' and self.role == 'group'

    def held_classes(self):
        held = [m.content for m in self.elems + self.alts if m.is_complex and not m.is_any]
        return held + ([self.base] if self.base else [])


def parse(path):
    state = {'group': None, 'enums': {}, 'classes': [], 'last': None}
    rows = []
    with open(path, encoding='utf-8') as f:
        for number, text in enumerate(f, 1):
            words = text.split('#', 1)[0].split()
            if not words:
                continue
            if words[0].startswith('"'):
                if not rows or rows[-1][1][0] != 'enum':
                    raise DescriptionError('%s:%d: a continued line outside an enumeration' % (path, number))
                rows[-1][1].extend(words)
            else:
                rows.append((number, words))
    # Enumerations first, so that a value may name one told further down.
    for number, words in rows:
        if words[0] == 'enum':
            try:
                parse_enum(words, number, state['enums'])
            except DescriptionError as e:
                raise DescriptionError('%s:%d: %s' % (path, number, e))
    for number, words in rows:
        try:
            parse_line(words, number, state, os.path.dirname(path))
        except DescriptionError as e:
            raise DescriptionError('%s:%d: %s' % (path, number, e))
    group, classes = state['group'], state['classes']
    if group is None:
        raise DescriptionError('%s: no group line' % path)
    known = {c.name for c in classes}
    for c in classes:
        for m in c.elems + c.alts:
            if m.is_complex and not m.is_any and m.content not in known:
                raise DescriptionError('%s:%d: unknown class %s' % (path, m.line, m.content))
        if c.base and c.base not in known:
            raise DescriptionError('%s:%d: unknown class %s' % (path, c.line, c.base))
        if c.kind == 'choice' and not c.alts:
            raise DescriptionError('%s:%d: choice %s has no alternative' % (path, c.line, c.name))
    return group, order_for_declaration(classes)


def order_for_declaration(classes):
    """The classes in description order, moved so that each comes after every
    class it holds or derives from."""
    by_name = {c.name: c for c in classes}
    done, ordered = set(), []

    def visit(c, path):
        if c.name in done:
            return
        if c.name in path:
            raise DescriptionError('class %s holds itself' % c.name)
        for held in c.held_classes():
            visit(by_name[held], path | {c.name})
        done.add(c.name)
        ordered.append(c)

    for c in classes:
        visit(c, set())
    return ordered


ENUM_ITEM = re.compile(r'^"([^"]+)"=([0-9]+)$')


def parse_enum(words, number, enums):
    if len(words) < 3 or not words[1].startswith('Eenum_'):
        raise DescriptionError('expected "enum Eenum_<X> "<text>"=1 ..."')
    texts = []
    for word in words[2:]:
        m = ENUM_ITEM.match(word)
        if not m:
            raise DescriptionError('expected "<text>"=<number>, not %s' % word)
        if int(m.group(2)) != len(texts) + 1:
            raise DescriptionError('enumeration numbers run 1, 2, ... in order')
        texts.append(m.group(1))
    if words[1] in enums:
        raise DescriptionError('enumeration %s told twice' % words[1])
    enums[words[1]] = Enumeration(words[1], texts, number)


def expect(words, count, form):
    if len(words) != count:
        raise DescriptionError('expected "%s"' % form)


def content_of(word, group, enums):
    """A class name for prefix::Class (or a c_ class of the top level), else
    a value kind."""
    if group.class_namespace and word.startswith(group.class_namespace + '::'):
        return word[len(group.class_namespace) + 2:]
    if not group.class_namespace and word.startswith('c_'):
        return word
    return value_kind(word, enums)


def element_local(word, group):
    prefix, colon, local = word.partition(':')
    if not colon:
        prefix, local = '', word
    if prefix != group.prefix or not local:
        raise DescriptionError('element %s is not in the group\'s namespace' % word)
    return local


def parse_line(words, number, state, directory):
    keyword = words[0]
    group, enums, classes = state['group'], state['enums'], state['classes']
    if keyword == 'group':
        expect(words, 6, 'group <prefix> <uri> <stem> <id> <namespace>')
        if group is not None:
            raise DescriptionError('a second group line')
        state['group'] = Group(words[1], words[2], words[3], int(words[4]), words[5])
        return
    if group is None:
        raise DescriptionError('the group line must come first')
    if keyword == 'enum':
        return
    if keyword in ('class', 'choice'):
        if len(words) < 3:
            raise DescriptionError('expected "%s <Class> ..."' % keyword)
        if any(c.name == words[1] for c in classes):
            raise DescriptionError('class %s told twice' % words[1])
        c = parse_class_line(words, number, group, enums, directory)
        classes.append(c)
        return
    if not classes:
        raise DescriptionError('%s outside a class' % keyword)
    owner = classes[-1]
    if keyword == 'attr':
        expect(words, 4, 'attr <Attribute> <Value> required|optional')
        if owner.kind in ('derived', 'choice'):
            raise DescriptionError('an attribute in %s class %s' % (owner.kind, owner.name))
        if words[3] not in ('required', 'optional'):
            raise DescriptionError('use must be required or optional')
        bounds = (1, 1) if words[3] == 'required' else (0, 1)
        owner.attrs.append(Member('attr', words[1], value_kind(words[2], enums), bounds, number,
                                  'Attribute %s: %s, %s.' % (words[1], words[2], words[3])))
    elif keyword == 'elem':
        expect(words, 5, 'elem <#> <prefix:Element> <Content> <Occurs>')
        if owner.kind != 'complex':
            raise DescriptionError('an element row in %s class %s' % (owner.kind, owner.name))
        if int(words[1]) != len(owner.elems) + 1:
            raise DescriptionError('element rows must be numbered 1, 2, ... in order')
        bounds = occurs(words[4])
        if words[2] == 'group':
            content = content_of(words[3], group, enums)
            if not isinstance(content, str):
                raise DescriptionError('a group row names a class')
            member = Member('group', content, content, bounds, number,
                            'Group %s: %s.' % (words[3], words[4]))
        else:
            local = element_local(words[2], group)
            member = Member('elem', local, content_of(words[3], group, enums), bounds, number,
                            'Element %s: %s, %s.' % (words[2], words[3], words[4]))
            member.map_index = len(owner.element_rows)
        owner.elems.append(member)
    elif keyword == 'alt':
        expect(words, 5, 'alt <Chosen> <prefix:Element> <Content> 1|1..n')
        if owner.kind != 'choice':
            raise DescriptionError('an alternative outside a choice')
        if int(words[1]) != len(owner.alts):
            raise DescriptionError('alternatives are numbered 0, 1, ... in order')
        if words[4] not in ('1', '1..n'):
            raise DescriptionError('an alternative occurs 1 or 1..n')
        if words[2] == 'any':
            if words[3] != 'foreign' or owner.role != 'group':
                raise DescriptionError('expected "alt 0 any foreign 1" in a group')
            local, content = 'any', '<any>'
        else:
            local, content = element_local(words[2], group), content_of(words[3], group, enums)
        member = Member('alt', local, content, occurs(words[4]), number,
                        'Alternative %s %s: %s, %s.' % (words[1], words[2], words[3], words[4]))
        member.chosen = int(words[1])
        if member.repeated and not member.is_complex:
            raise DescriptionError('a run of plain values is not supported')
        owner.alts.append(member)
    else:
        raise DescriptionError('unknown keyword %s' % keyword)
    names = [m.name for m in owner.attrs] + [m.name for m in owner.elems] + [m.name for m in owner.alts]
    if len(set(m.name for m in owner.attrs)) != len(owner.attrs) or \
            len(set(names[len(owner.attrs):])) != len(names) - len(owner.attrs):
        raise DescriptionError('%s told twice in class %s' % (words[1], owner.name))


def parse_class_line(words, number, group, enums, directory):
    name = words[1]
    if words[0] == 'choice':
        if len(words) != 4 or words[2] not in ('element', 'group', 'document') or words[3] not in ('once', 'repeat'):
            raise DescriptionError('expected "choice <Class> element|group|document once|repeat"')
        c = Class(name, 'choice', number)
        c.role = words[2]
        c.repeat = words[3] == 'repeat'
        if c.repeat and c.role != 'group':
            raise DescriptionError('only a group repeats')
        return c
    kind = words[2]
    rest = words[3:]
    if kind == 'simple':
        if not rest:
            raise DescriptionError('expected "class <Class> simple <Value>"')
        c = Class(name, 'simple', number)
        c.body = value_kind(rest[0], enums)
        rest = rest[1:]
    elif kind == 'derives':
        if len(rest) != 1:
            raise DescriptionError('expected "class <Class> derives <Base>"')
        c = Class(name, 'derived', number)
        c.base = rest[0]
        rest = []
    elif kind in ('empty', 'complex'):
        c = Class(name, kind, number)
    else:
        raise DescriptionError('content must be empty, complex, simple <Value> or derives <Base>')
    for flag in rest:
        if flag.startswith('members='):
            c.members_file = os.path.join(directory, '..', flag[len('members='):])
            if not os.path.isfile(c.members_file):
                raise DescriptionError('no file %s' % c.members_file)
        elif flag in CLASS_FLAGS:
            c.flags.add(flag)
        else:
            raise DescriptionError('unknown flag %s' % flag)
    if 'nillable' in c.flags and kind != 'simple':
        raise DescriptionError('only a simple class is nillable')
    return c
