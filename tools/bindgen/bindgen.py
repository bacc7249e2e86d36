#!/usr/bin/env python3
"""Writes the bound classes of one CxF3 group from its table description.

    bindgen.py <description.schema> <output directory>

Reads a description such as cxf/v3/schema/cxf3.schema (format in README.md
beside this script) and writes <stem>.h and <stem>.cpp into the output
directory, <stem> being the source stem of the group line. A file is only
rewritten when its text changes, so that the build does not recompile what
did not change. Any error in the description stops the run with the file
name and line number.
"""

import os
import re
import sys

# ---------------------------------------------------------------- values

# A value shorthand of the tables and how it is held and checked: the C++
# type, whether it is passed by value (a plain old datatype), the name of
# its validation spec function, the whitespace mode, the lexical and the
# value validator.
class ValueKind:
    def __init__(self, cpp_type, pod, spec, whitespace, lexical, value_check):
        self.cpp_type = cpp_type
        self.pod = pod
        self.spec = spec
        self.whitespace = whitespace
        self.lexical = lexical
        self.value_check = value_check or 'lmx::value_validator_none<%s>' % cpp_type

    def param(self):
        return '%s a_value' % self.cpp_type if self.pod else 'const %s &ar_value' % self.cpp_type

    def arg(self):
        return 'a_value' if self.pod else 'ar_value'

    def result(self):
        return self.cpp_type + ' ' if self.pod else 'const %s &' % self.cpp_type


VALUES = {
    'string': ValueKind('std::wstring', False, 'spec_string', 'lmx::ws_preserve', 'lmx::lexical_validator_none',
                        None),
    'dateTime': ValueKind('lmx::c_datetime', False, 'spec_datetime', 'lmx::ws_collapse',
                          'lmx::lexical_validator_datetime', None),
    'double': ValueKind('double', True, 'spec_double', 'lmx::ws_collapse', 'lmx::lexical_validator_float', None),
}

OCCURS = {'1': (1, 1), '0..1': (0, 1), '0..n': (0, None), '1..n': (1, None)}

# Event numbers below this are the reader's own.
FIRST_EVENT = 12

WIDTH = 120


# ---------------------------------------------------------------- description

class DescriptionError(Exception):
    pass


class Group:
    def __init__(self, prefix, uri, stem, ns_id):
        self.prefix = prefix
        self.uri = uri
        self.stem = stem
        self.ns_id = ns_id


class Member:
    """An attribute or a child element of a class."""

    def __init__(self, kind, name, content, occurs, line, note):
        self.kind = kind  # 'attr' or 'elem'
        self.note = note  # the row as a comment for the accessors
        self.name = name  # local name
        self.content = content  # ValueKind, or the class name for a complex child
        self.min, self.max = occurs
        self.line = line

    @property
    def is_complex(self):
        return isinstance(self.content, str)

    @property
    def required(self):
        return self.min > 0

    @property
    def repeated(self):
        return self.max is None

    def container(self):
        if self.is_complex:
            if self.repeated:
                return 'lmx::ct_complex_multi<%s>' % self.content
            return 'lmx::ct_complex_%s<%s>' % ('single' if self.required else 'optional', self.content)
        if self.repeated:
            raise DescriptionError('line %d: a repeated element of plain value is not generated yet' % self.line)
        return 'lmx::ct_simple_%s_%s<%s>' % ('pod' if self.content.pod else 'non_pod',
                                              'single' if self.required else 'optional', self.content.cpp_type)


class Class:
    def __init__(self, name, content, line):
        self.name = name
        self.content = content  # 'empty' or 'complex'
        self.line = line
        self.attrs = []
        self.elems = []

    @property
    def members(self):
        return self.attrs + self.elems

    @property
    def required_attrs(self):
        return [m for m in self.attrs if m.required]

    @property
    def body_can_be_empty(self):
        return not any(e.required for e in self.elems)


def parse(path):
    group = None
    classes = []
    with open(path, encoding='utf-8') as f:
        for number, text in enumerate(f, 1):
            words = text.split('#', 1)[0].split()
            if not words:
                continue
            try:
                group = parse_line(words, number, group, classes)
            except DescriptionError as e:
                raise DescriptionError('%s:%d: %s' % (path, number, e))
    if group is None:
        raise DescriptionError('%s: no group line' % path)
    known = {c.name for c in classes}
    for c in classes:
        for m in c.elems:
            if m.is_complex and m.content not in known:
                raise DescriptionError('%s:%d: unknown class %s' % (path, m.line, m.content))
    return group, classes


def expect(words, count, form):
    if len(words) != count:
        raise DescriptionError('expected "%s"' % form)


def value_kind(word):
    if word not in VALUES:
        raise DescriptionError('value %s is not generated yet' % word)
    return VALUES[word]


def parse_line(words, number, group, classes):
    keyword = words[0]
    if keyword == 'group':
        expect(words, 5, 'group <prefix> <uri> <stem> <id>')
        if group is not None:
            raise DescriptionError('a second group line')
        return Group(words[1], words[2], words[3], int(words[4]))
    if group is None:
        raise DescriptionError('the group line must come first')
    if keyword == 'class':
        if len(words) < 3:
            raise DescriptionError('expected "class <Class> <content>"')
        if words[2] not in ('empty', 'complex'):
            raise DescriptionError('content %s is not generated yet' % ' '.join(words[2:]))
        expect(words, 3, 'class <Class> empty|complex')
        if any(c.name == words[1] for c in classes):
            raise DescriptionError('class %s told twice' % words[1])
        classes.append(Class(words[1], words[2], number))
        return group
    if not classes:
        raise DescriptionError('%s outside a class' % keyword)
    owner = classes[-1]
    if keyword == 'attr':
        expect(words, 4, 'attr <Attribute> <Value> required|optional')
        if words[3] not in ('required', 'optional'):
            raise DescriptionError('use must be required or optional')
        occurs = (1, 1) if words[3] == 'required' else (0, 1)
        owner.attrs.append(Member('attr', words[1], value_kind(words[2]), occurs, number,
                                  'Attribute %s: %s, %s.' % (words[1], words[2], words[3])))
    elif keyword == 'elem':
        expect(words, 5, 'elem <#> <prefix:Element> <Content> <Occurs>')
        if owner.content == 'empty':
            raise DescriptionError('an element in the empty class %s' % owner.name)
        if int(words[1]) != len(owner.elems) + 1:
            raise DescriptionError('element rows must be numbered 1, 2, ... in order')
        prefix, _, local = words[2].partition(':')
        if prefix != group.prefix or not local:
            raise DescriptionError('element %s is not in group %s' % (words[2], group.prefix))
        if words[4] not in OCCURS:
            raise DescriptionError('occurs must be one of %s' % ', '.join(OCCURS))
        content = words[3]
        if content.startswith(group.prefix + '::'):
            content = content[len(group.prefix) + 2:]
        else:
            content = value_kind(content)
        owner.elems.append(Member('elem', local, content, OCCURS[words[4]], number,
                                  'Element %s: %s, %s.' % (words[2], words[3], words[4])))
    else:
        raise DescriptionError('unknown keyword %s' % keyword)
    if len({m.name for m in owner.attrs}) != len(owner.attrs) or \
            len({m.name for m in owner.elems}) != len(owner.elems):
        raise DescriptionError('%s told twice in class %s' % (words[1], owner.name))
    return group


# ---------------------------------------------------------------- layout

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


# ---------------------------------------------------------------- generator

class Generator:
    def __init__(self, group, classes, description):
        self.group = group
        self.classes = classes
        self.description = description
        self.events = {}
        for c in classes:
            for m in c.members:
                self.events.setdefault(m.name, FIRST_EVENT + len(self.events))
        self.specs = []  # value kinds in first use order
        for c in classes:
            for m in c.members:
                if not m.is_complex and m.content not in self.specs:
                    self.specs.append(m.content)
        elems = [m for c in classes for m in c.elems]
        self.uses = {
            'read_attribute': any(c.attrs for c in classes),
            'read_optional_child': any(not m.is_complex and not m.required for m in elems),
            'read_required_child': any(not m.is_complex and m.required for m in elems),
            'read_class_child': any(m.is_complex for m in elems),
            'report_missing_element': any(m.is_complex and m.required for m in elems),
        }

    def banner(self):
        return ['// Generated by tools/bindgen/bindgen.py from %s. Do not edit: change the' % self.description,
                '// description or the generator.']

    # -------------------------------------------------------- header

    def header(self):
        g = self.group
        guard = 'TESSARINE_CXF_V3_%s_H' % re.sub('[^A-Za-z0-9]', '_', g.stem).upper()
        out = self.banner()
        out += ['//',
                '// The bound classes of the %s group: one class per type, each reading and' % g.prefix,
                '// writing itself through the lmx runtime.',
                '#ifndef ' + guard,
                '#define ' + guard,
                '',
                '#include <cstddef>',
                '#include <ostream>',
                '#include <string>',
                '',
                '#include <lmx/lmxparse.h>',
                '',
                'namespace %s {' % g.prefix,
                '',
                'inline constexpr const char *k_namespace_uri = "%s";' % g.uri,
                '// The source name of this group\'s error reports.',
                'inline constexpr const char *k_source_stem = "%s";' % g.stem,
                '',
                'const lmx::s_ns_map *ns_map_reader();',
                'const lmx::s_ns_map *ns_map_writer_1();',
                '']
        for c in self.classes:
            out.append('class %s;' % c.name)
        for c in self.classes:
            out += [''] + self.class_declaration(c)
        out += ['', '} // namespace ' + g.prefix, '', '#endif']
        return out

    def class_declaration(self, c):
        g = self.group
        n = c.name
        debug = 'lmx::s_debug_error *ap_debug = nullptr'
        out = ['// ---------------------------------------------------------------- %s' % n, '',
               'class %s {' % n,
               'public:',
               '    static constexpr const char *k_local_name = "%s";' % n,
               '    static constexpr const char *k_element_name = "%s:%s";' % (g.prefix, n),
               '',
               '    %s();' % n,
               '    %s(lmx::c_xml_reader &ar_reader, lmx::elmx_error *ap_error);' % n]
        for params in (['const char *ap_file'], ['const wchar_t *ap_file'],
                       ['const char *ap_memory', 'std::size_t a_size'], ['const std::string &ar_text'],
                       ['const lmx::c_any_info &ar_any']):
            out += call(n, params + ['lmx::elmx_error *ap_error', debug], ';', 4)
        out += ['    %s(const %s &ar_other);' % (n, n),
                '    %s &operator=(const %s &ar_other);' % (n, n),
                '    virtual %s *clone() const;' % n,
                '    virtual ~%s();' % n,
                '',
                '    void init();',
                '    void reset();',
                '    void swap(%s &ar_other);' % n,
                '    bool is_occurs_ok() const;',
                '']
        for m in c.members:
            out += self.accessors(m)
        out += ['',
                '    lmx::elmx_error marshal(lmx::c_xml_writer &ar_writer) const;',
                '    lmx::elmx_error marshal(lmx::c_xml_writer &ar_writer, const char *ac_name) const;']
        for target in ('const char *ap_file', 'const wchar_t *ap_file', 'std::string &ar_out',
                       'std::ostream &ar_os'):
            out.append('    lmx::elmx_error marshal(%s, %s) const;' % (target, debug))
        out += ['    lmx::elmx_error marshal_attributes(lmx::c_xml_writer &ar_writer) const;',
                '    lmx::elmx_error marshal_child_elements(lmx::c_xml_writer &ar_writer) const;',
                '',
                '    lmx::elmx_error unmarshal(lmx::c_xml_reader &ar_reader);',
                '    lmx::elmx_error unmarshal(lmx::c_xml_reader &ar_reader, const std::string &ar_name);']
        for source in ('const char *ap_file', 'const wchar_t *ap_file',
                       'const char *ap_memory, std::size_t a_size', 'const lmx::c_any_info &ar_any'):
            out.append('    lmx::elmx_error unmarshal(%s, %s);' % (source, debug))
        if c.attrs:
            out.append('    bool unmarshal_attributes(lmx::c_xml_reader &ar_reader, lmx::elmx_error *ap_error);')
        if c.required_attrs:
            out.append('    lmx::elmx_error unmarshal_attributes_check(lmx::c_xml_reader &ar_reader);')
        if c.content == 'complex':
            out.append('    bool unmarshal_body(lmx::c_xml_reader &ar_reader, lmx::elmx_error *ap_error);')
        out += ['',
                '    static const lmx::s_event_map *attr_event_map();',
                '    static const lmx::s_event_map *elem_event_map();',
                '',
                'private:']
        for m in c.members:
            out.append('    %s m_%s;' % (m.container(), m.name))
        out.append('};')
        return out

    def accessors(self, m):
        return ['    // ' + m.note] + self.accessor_family(m)

    def accessor_family(self, m):
        x = m.name
        if m.is_complex and m.repeated:
            t = m.content
            return ['    %s &get_%s(std::size_t a_index) { return m_%s.get(a_index); }' % (t, x, x),
                    '    const %s &get_%s(std::size_t a_index) const { return m_%s.get(a_index); }' % (t, x, x),
                    '    %s &append_%s() { return m_%s.append(); }' % (t, x, x),
                    '    %s &append_%s(const %s &ar_item) { return m_%s.append(ar_item); }' % (t, x, t, x),
                    '    %s &back_%s() { return m_%s.back(); }' % (t, x, x),
                    '    %s &insert_%s(std::size_t a_index) { return m_%s.insert(a_index); }' % (t, x, x),
                    *call('    %s &insert_%s' % (t, x), ['std::size_t a_index', 'const %s &ar_item' % t],
                          ' { return m_%s.insert(a_index, ar_item); }' % x, 0),
                    '    void delete_%s(std::size_t a_index) { m_%s.erase(a_index); }' % (x, x),
                    '    void clear_%s() { m_%s.clear(); }' % (x, x),
                    *call('    void assign_%s' % x, ['std::size_t a_index', 'const %s &ar_item' % t],
                          ' { m_%s.assign(a_index, ar_item); }' % x, 0),
                    '    std::size_t size_%s() const { return m_%s.size(); }' % (x, x)]
        if m.is_complex:
            t = m.content
            out = ['    %s &get_%s() { return m_%s.get(); }' % (t, x, x),
                   '    // Null while unset.',
                   '    const %s *get_%s() const { return m_%s.get(); }' % (t, x, x),
                   '    void assign_%s(const %s &ar_item) { m_%s.assign(ar_item); }' % (x, t, x)]
        else:
            v = m.content
            out = ['    %sget_%s() const { return m_%s.get(); }' % (v.result(), x, x),
                   '    lmx::elmx_error set_%s(%s) {' % (x, v.param()),
                   '        m_%s.set(%s);' % (x, v.arg()),
                   '        return lmx::elmx_ok;',
                   '    }']
        if not m.required:
            out += ['    bool isset_%s() const { return m_%s.is_value_set(); }' % (x, x),
                    '    void unset_%s() { m_%s.unset(); }' % (x, x)]
        return out

    # -------------------------------------------------------- source

    def source(self):
        g = self.group
        out = self.banner()
        out += ['#include <cxf/v3/%s.h>' % g.stem,
                '',
                'namespace %s {' % g.prefix,
                '',
                'const lmx::s_ns_map *ns_map_reader() {',
                '    static const lmx::s_ns_map s_map[] = {{%d, "%s", k_namespace_uri}, {0, nullptr, nullptr}};'
                % (g.ns_id, g.prefix),
                '    return s_map;',
                '}',
                '',
                'const lmx::s_ns_map *ns_map_writer_1() {',
                '    static const lmx::s_ns_map s_map[] = {{%d, "%s", k_namespace_uri}, {0, nullptr, nullptr}};'
                % (g.ns_id, g.prefix),
                '    return s_map;',
                '}',
                '',
                'namespace {',
                '',
                '// One event number per local name across the group, attributes and',
                '// elements alike.',
                'enum {']
        names = list(self.events)
        for i, name in enumerate(names):
            out.append('    e_%s%s,' % (name, ' = %d' % FIRST_EVENT if i == 0 else ''))
        out[-1] = out[-1].rstrip(',')
        out += ['};', '']
        out += self.spec_functions()
        out += self.common_steps()
        out += ['} // namespace']
        for c in self.classes:
            out += [''] + self.class_definition(c)
        out += ['', '} // namespace ' + g.prefix]
        return out

    def spec_functions(self):
        out = ['// ---------------------------------------------------------------- value specs', '']
        for v in self.specs:
            t = v.cpp_type
            out += ['const lmx::ct_typed_validation_spec<%s> &%s() {' % (t, v.spec)]
            out += call('    static const lmx::ct_typed_validation_spec<%s> s_spec' % t,
                        [v.whitespace, '""', '&' + v.lexical, '&' + v.value_check, '&lmx::v_to_o<%s>' % t,
                         '&lmx::o_to_v<%s>' % t], ';', 0)
            out += ['    return s_spec;', '}', '']
        return out

    def common_steps(self):
        g = self.group
        out = ['// ---------------------------------------------------------------- reading and writing steps',
               '',
               '// The start of reading a document as X: the first element must be',
               '// X\'s own, in the group\'s namespace.',
               'template <typename X> lmx::elmx_error unmarshal_document(X &ar_object, lmx::c_xml_reader &ar_reader) {',
               '    ar_reader.set_code_file(k_source_stem);',
               '    ar_reader.set_ns_map(ns_map_reader());',
               '    lmx::c_xml_reader_local local(ar_reader);',
               '    std::string name;',
               '    lmx::elmx_error error;',
               '    ar_reader.set_code_line(1);',
               '    ar_reader.get_element_event(&error, &name);',
               '    if (error != lmx::elmx_ok && (error = ar_reader.handle_error(error, name, k_source_stem, 1)) != lmx::elmx_ok)',
               '        return error;',
               '    if (ar_reader.get_current_event() != lmx::xe_name || ar_reader.get_element_ns_id() != %d ||' % g.ns_id,
               '        ar_reader.get_local_name() != X::k_local_name)',
               '        return ar_reader.handle_error(lmx::elmx_element_not_found, name, k_source_stem, 2);',
               '    return ar_object.unmarshal(ar_reader, name);',
               '}',
               '',
               '// Writing an element of class X under ac_name; the namespace',
               '// declarations go on the outermost element only.',
               'template <typename X>',
               'lmx::elmx_error write_element(const X &ar_object, lmx::c_xml_writer &ar_writer, const char *ac_name) {',
               '    lmx::c_xml_writer_local local(ar_writer);',
               '    ar_writer.start_element(ac_name);',
               '    ar_writer.conditionally_select_ns_map(ns_map_writer_1());',
               '    ar_writer.conditionally_write_ns_attrs(true);',
               '    if (lmx::elmx_error error = ar_object.marshal_attributes(ar_writer))',
               '        return error;',
               '    if (lmx::elmx_error error = ar_object.marshal_child_elements(ar_writer))',
               '        return error;',
               '    ar_writer.end_element(ac_name);',
               '    return lmx::elmx_ok;',
               '}',
               '']
        if self.uses['read_attribute']:
            out += ['// One case of an attribute switch: the attribute is the class\'s, read it.',
                    'template <typename Item, typename T>',
                    'bool read_attribute(lmx::c_xml_reader &ar_reader, int a_line, Item &ar_item,',
                    '                    const lmx::ct_typed_validation_spec<T> &ar_spec, lmx::elmx_error *ap_error) {',
                    '    ar_reader.set_code_line(a_line);',
                    '    *ap_error = ar_reader.unmarshal_attribute_value(ar_item, ar_spec);',
                    '    return true;',
                    '}',
                    '']
        if self.uses['read_optional_child']:
            out += ['// A plain child that may be left out: read it if it is the current event.',
                    '// False, with the verdict in *ap_error, when reading stops.',
                    'template <typename Item, typename T>',
                    'bool read_optional_child(lmx::c_xml_reader &ar_reader, int a_event, Item &ar_item,',
                    '                         const lmx::ct_typed_validation_spec<T> &ar_spec, const lmx::s_event_map *ac_tail,',
                    '                         int a_line, lmx::elmx_error *ap_error) {',
                    '    if (ar_reader.get_current_event() != a_event)',
                    '        return true;',
                    '    ar_reader.set_code_line(a_line);',
                    '    *ap_error = ar_reader.unmarshal_child_element(ar_item, ar_spec, ac_tail);',
                    '    return *ap_error == lmx::elmx_ok;',
                    '}',
                    '']
        if self.uses['read_required_child']:
            out += ['// A required plain child: read it if it is the current event, else report',
                    '// it missing; a cleared report goes on with the next child.',
                    'template <typename Item, typename T>',
                    'bool read_required_child(lmx::c_xml_reader &ar_reader, int a_event, Item &ar_item,',
                    '                         const lmx::ct_typed_validation_spec<T> &ar_spec, const lmx::s_event_map *ac_tail,',
                    '                         const char *ac_name, int a_line, lmx::elmx_error *ap_error) {',
                    '    ar_reader.set_code_line(a_line);',
                    '    if (ar_reader.get_current_event() == a_event)',
                    '        *ap_error = ar_reader.unmarshal_child_element(ar_item, ar_spec, ac_tail);',
                    '    else',
                    '        *ap_error = ar_reader.handle_error(lmx::elmx_mandatory_element_missing, ac_name, k_source_stem, a_line);',
                    '    return *ap_error == lmx::elmx_ok;',
                    '}',
                    '']
        if self.uses['read_class_child']:
            out += ['// A child of a bound class, whose start tag is the current event; then the',
                    '// next event against the rest of the table.',
                    'template <typename X>',
                    'bool read_class_child(lmx::c_xml_reader &ar_reader, X &ar_item, const lmx::s_event_map *ac_tail, int a_line,',
                    '                      lmx::elmx_error *ap_error) {',
                    '    ar_reader.set_code_line(a_line);',
                    '    if ((*ap_error = ar_item.unmarshal(ar_reader, ar_reader.get_name())) != lmx::elmx_ok)',
                    '        return false;',
                    '    ar_reader.get_element_event(ac_tail, ap_error, &ar_reader.get_name_buffer());',
                    '    return *ap_error == lmx::elmx_ok || (*ap_error = ar_reader.handle_error(*ap_error)) == lmx::elmx_ok;',
                    '}',
                    '']
        if self.uses['report_missing_element']:
            out += ['// A required child that is not there; true if the report was cleared.',
                    'bool report_missing_element(lmx::c_xml_reader &ar_reader, const char *ac_name, int a_line,',
                    '                            lmx::elmx_error *ap_error) {',
                    '    ar_reader.set_code_line(a_line);',
                    '    *ap_error = ar_reader.handle_error(lmx::elmx_mandatory_element_missing, ac_name, k_source_stem, a_line);',
                    '    return *ap_error == lmx::elmx_ok;',
                    '}',
                    '']
        return out

    def class_definition(self, c):
        n = c.name
        site = 100 * (self.classes.index(c) + 1)
        debug = 'lmx::s_debug_error *ap_debug'
        helper = n + '_unmarshal_helper'
        out = ['// ---------------------------------------------------------------- %s' % n, '',
               'namespace {', '',
               '// Hands the callbacks of the unmarshal driver to %s.' % n,
               'class %s : public lmx::c_unmarshal_helper {' % helper,
               'public:']
        out += ['    %s(%s *ap_object, lmx::c_xml_reader &ar_reader)' % (helper, n),
                '        : c_unmarshal_helper(ar_reader), p_object(ap_object) {}']
        if c.attrs:
            out += ['    bool unmarshal_attribute(lmx::elmx_error *ap_error) override {',
                    '        *ap_error = lmx::elmx_ok;',
                    '        return p_object->unmarshal_attributes(ar_reader, ap_error);',
                    '    }']
        if c.required_attrs:
            out += ['    lmx::elmx_error unmarshal_attributes_check() override {',
                    '        return p_object->unmarshal_attributes_check(ar_reader);',
                    '    }']
        if c.content == 'complex':
            out += ['    bool unmarshal_complex_body(lmx::elmx_error *ap_error) override {',
                    '        return p_object->unmarshal_body(ar_reader, ap_error);',
                    '    }']
        out += ['', 'private:', '    %s *p_object;' % n, '};', '', '} // namespace', '']

        # Construction and copying.
        out += ['%s::%s() { init(); }' % (n, n), '']
        out += ['%s::%s(lmx::c_xml_reader &ar_reader, lmx::elmx_error *ap_error) {' % (n, n),
                '    init();', '    *ap_error = unmarshal(ar_reader);', '}', '']
        for params, args in ((['const char *ap_file'], 'ap_file'), (['const wchar_t *ap_file'], 'ap_file'),
                             (['const char *ap_memory', 'std::size_t a_size'], 'ap_memory, a_size'),
                             (['const std::string &ar_text'], 'ar_text.data(), ar_text.size()'),
                             (['const lmx::c_any_info &ar_any'], 'ar_any')):
            out += call('%s::%s' % (n, n), params + ['lmx::elmx_error *ap_error', debug], ' {', 0)
            out += ['    init();', '    *ap_error = unmarshal(%s, ap_debug);' % args, '}', '']
        out += ['%s::%s(const %s &) = default;' % (n, n, n), '',
                '%s &%s::operator=(const %s &ar_other) {' % (n, n, n),
                '    %s copy(ar_other);' % n, '    swap(copy);', '    return *this;', '}', '',
                '%s *%s::clone() const { return new %s(*this); }' % (n, n, n), '',
                '%s::~%s() = default;' % (n, n), '',
                'void %s::init() {}' % n, '',
                'void %s::reset() {' % n, '    %s fresh;' % n, '    swap(fresh);', '}', '']
        if c.members:
            out.append('void %s::swap(%s &ar_other) {' % (n, n))
            out += ['    m_%s.swap(ar_other.m_%s);' % (m.name, m.name) for m in c.members]
            out.append('}')
        else:
            out.append('void %s::swap(%s &) {}' % (n, n))
        out.append('')
        checks = ['m_%s.is_occurs_ok(%s)' % (m.name, m.min if m.repeated else '') for m in c.members
                  if m.required]
        has_required = bool(checks)
        out += self.returning('bool %s::is_occurs_ok() const' % n, checks or ['true'], ' &&')
        out.append('')

        # Writing.
        out += ['lmx::elmx_error %s::marshal(lmx::c_xml_writer &ar_writer) const {' % n,
                '    return marshal(ar_writer, k_element_name);', '}', '',
                'lmx::elmx_error %s::marshal(lmx::c_xml_writer &ar_writer, const char *ac_name) const {' % n]
        if has_required:
            out += ['    if (!is_occurs_ok())', '        return lmx::elmx_marshal_occurs_error;']
        out += ['    return write_element(*this, ar_writer, ac_name);', '}', '']
        for target, arg in (('const char *ap_file', 'ap_file'), ('const wchar_t *ap_file', 'ap_file'),
                            ('std::string &ar_out', 'ar_out'), ('std::ostream &ar_os', 'ar_os')):
            out += ['lmx::elmx_error %s::marshal(%s, %s) const {' % (n, target, debug),
                    '    return lmx::marshal(*this, %s, ap_debug);' % arg, '}', '']
        out += ['lmx::elmx_error %s::marshal_attributes(lmx::c_xml_writer &ar_writer) const {' % n,
                '    ar_writer.set_code_file(k_source_stem);']
        for m in c.attrs:
            out += call('    if (lmx::elmx_error error = ar_writer.marshal_attribute',
                        ['"%s"' % m.name, 'm_' + m.name, m.content.spec + '()'], ')', 0)
            out.append('        return error;')
        out += ['    return lmx::elmx_ok;', '}', '']
        if c.elems:
            out.append('lmx::elmx_error %s::marshal_child_elements(lmx::c_xml_writer &ar_writer) const {' % n)
            for m in c.elems:
                out += self.marshal_child(m)
            out += ['    return lmx::elmx_ok;', '}', '']
        else:
            out += ['lmx::elmx_error %s::marshal_child_elements(lmx::c_xml_writer &) const { return lmx::elmx_ok; }'
                    % n, '']

        # Reading.
        out += ['lmx::elmx_error %s::unmarshal(lmx::c_xml_reader &ar_reader) {' % n,
                '    return unmarshal_document(*this, ar_reader);', '}', '',
                'lmx::elmx_error %s::unmarshal(lmx::c_xml_reader &ar_reader, const std::string &ar_name) {' % n,
                '    ar_reader.set_name(ar_name);',
                '    %s helper(this, ar_reader);' % helper]
        if c.content == 'complex':
            if c.body_can_be_empty:
                out.append('    helper.set_body_can_be_empty();')
            out.append('    return helper.unmarshal_complex_content(k_source_stem, %d);' % site)
        else:
            out.append('    return helper.unmarshal_empty_content(k_source_stem, %d);' % site)
        out += ['}', '']
        for source, args in (('const char *ap_file', 'ap_file'), ('const wchar_t *ap_file', 'ap_file'),
                             ('const char *ap_memory, std::size_t a_size', 'ap_memory, a_size'),
                             ('const lmx::c_any_info &ar_any', 'ar_any')):
            out += ['lmx::elmx_error %s::unmarshal(%s, %s) {' % (n, source, debug),
                    '    return lmx::unmarshal(*this, %s, ap_debug);' % args, '}', '']
        site += 1
        if c.attrs:
            out += ['bool %s::unmarshal_attributes(lmx::c_xml_reader &ar_reader, lmx::elmx_error *ap_error) {' % n,
                    '    ar_reader.tokenise(attr_event_map(), lmx::ea_attribute);',
                    '    switch (ar_reader.get_current_event()) {']
            for m in c.attrs:
                out.append('    case e_%s:' % m.name)
                out += call('        return read_attribute',
                            ['ar_reader', str(site), 'm_' + m.name, m.content.spec + '()', 'ap_error'], ';', 0)
                site += 1
            out += ['    }', '    return false;', '}', '']
        if c.required_attrs:
            out.append('lmx::elmx_error %s::unmarshal_attributes_check(lmx::c_xml_reader &ar_reader) {' % n)
            for m in c.required_attrs:
                out += ['    if (!m_%s.is_value_set()) {' % m.name]
                out += call('        if (lmx::elmx_error error = ar_reader.handle_error',
                            ['lmx::elmx_required_attribute_missing', '"%s"' % n, 'k_source_stem', str(site)],
                            ')', 0)
                out += ['            return error;', '    }']
                site += 1
            out += ['    return lmx::elmx_ok;', '}', '']
        if c.content == 'complex':
            out += ['bool %s::unmarshal_body(lmx::c_xml_reader &ar_reader, lmx::elmx_error *ap_error) {' % n,
                    '    const lmx::s_event_map *map = elem_event_map();',
                    '    *ap_error = lmx::elmx_ok;',
                    '    ar_reader.tokenise(map, lmx::ea_element);']
            for row, m in enumerate(c.elems):
                out += self.unmarshal_child(m, row, site)
                site += 1
            out += ['    return true;', '}', '']

        # Event tables.
        out += self.event_map(n, 'attr_event_map', 1, c.attrs)
        out += [''] + self.event_map(n, 'elem_event_map', self.group.ns_id, c.elems)
        return out

    def returning(self, signature, terms, joiner):
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

    def marshal_child(self, m):
        name = '"%s:%s"' % (self.group.prefix, m.name)
        if not m.is_complex:
            return call('    if (lmx::elmx_error error = ar_writer.marshal_element',
                        [name, 'm_' + m.name, m.content.spec + '()', 'nullptr'], ')', 0) + ['        return error;']
        if m.repeated:
            return ['    for (std::size_t i = 0; i < m_%s.size(); ++i)' % m.name,
                    '        if (lmx::elmx_error error = m_%s.get(i).marshal(ar_writer, %s))' % (m.name, name),
                    '            return error;']
        return ['    if (const %s *p_item = m_%s.get())' % (m.content, m.name),
                '        if (lmx::elmx_error error = p_item->marshal(ar_writer, %s))' % name,
                '            return error;']

    def unmarshal_child(self, m, row, site):
        x = m.name
        tail = 'map + %d' % row
        name = '"%s:%s"' % (self.group.prefix, x)
        if not m.is_complex:
            if m.required:
                args = ['ar_reader', 'e_' + x, 'm_' + x, m.content.spec + '()', tail, name, str(site), 'ap_error']
                head = '    if (!read_required_child'
            else:
                args = ['ar_reader', 'e_' + x, 'm_' + x, m.content.spec + '()', tail, str(site), 'ap_error']
                head = '    if (!read_optional_child'
            return call(head, args, ')', 0) + ['        return false;']
        missing = ['    if (ar_reader.get_current_event() != e_%s && !report_missing_element(ar_reader, %s, %d, ap_error))'
                   % (x, name, site),
                   '        return false;']
        if m.repeated:
            out = missing if m.required else []
            return out + ['    while (ar_reader.get_current_event() == e_%s)' % x,
                          '        if (!read_class_child(ar_reader, m_%s.append(), %s, %d, ap_error))' % (x, tail, site),
                          '            return false;']
        out = missing if m.required else []
        return out + ['    if (ar_reader.get_current_event() == e_%s &&' % x,
                      '        !read_class_child(ar_reader, m_%s.get(), %s, %d, ap_error))' % (x, tail, site),
                      '        return false;']

    def event_map(self, n, function, ns_id, members):
        out = ['const lmx::s_event_map *%s::%s() {' % (n, function)]
        if not members:
            out.append('    static const lmx::s_event_map s_map[] = {{0, nullptr, 0, 1}};')
        else:
            out.append('    static const lmx::s_event_map s_map[] = {')
            for m in members:
                out.append('        {%d, "%s", %d, e_%s},' % (ns_id, m.name, len(m.name), m.name))
            out += ['        {0, nullptr, 0, 1},', '    };']
        out += ['    return s_map;', '}']
        return out


# ---------------------------------------------------------------- main

def write_if_changed(path, lines):
    text = '\n'.join(lines) + '\n'
    try:
        with open(path, encoding='utf-8') as f:
            if f.read() == text:
                return
    except OSError:
        pass
    with open(path, 'w', encoding='utf-8') as f:
        f.write(text)


def main(argv):
    if len(argv) != 3:
        sys.stderr.write('usage: bindgen.py <description.schema> <output directory>\n')
        return 2
    description, out_dir = argv[1], argv[2]
    try:
        group, classes = parse(description)
        shown = description
        # Name the description by its place in the repository, not the build's.
        match = re.search(r'(cxf/v3/schema/[^/]+)$', description.replace(os.sep, '/'))
        if match:
            shown = match.group(1)
        gen = Generator(group, classes, shown)
        header, source = gen.header(), gen.source()
    except DescriptionError as e:
        sys.stderr.write('bindgen: %s\n' % e)
        return 1
    os.makedirs(out_dir, exist_ok=True)
    write_if_changed(os.path.join(out_dir, group.stem + '.h'), header)
    write_if_changed(os.path.join(out_dir, group.stem + '.cpp'), source)
    return 0


if __name__ == '__main__':
    sys.exit(main(sys.argv))
