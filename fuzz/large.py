#!/usr/bin/env python3
"""Writes inputs of 1 MiB that repeat one thing, each to cost a reader the most: fuzz/large.py FOLDER.

FOLDER gets a folder for each target. scripts/fuzz --large runs the targets over them and tells time and memory.
"""
import pathlib
import struct
import sys

SIZE = 1 << 20


def repeat(begin, piece, end='', prefix=b''):
    begin, piece, end = (text.encode() for text in (begin, piece, end))
    room = SIZE - len(prefix) - len(begin) - len(end)
    return prefix + begin + piece * (room // len(piece)) + end


def count(begin, form, end='', prefix=b''):
    """Repeats `form` with rising numbers in it."""
    pieces, room = [], SIZE - len(prefix) - len(begin) - len(end)
    while room > 0:
        pieces.append(form.replace('#', f'{len(pieces):x}'))
        room -= len(pieces[-1])
    return prefix + (begin + ''.join(pieces[:-1]) + end).encode()


def xml_parser():
    for habit in range(3):
        start = bytes([0, habit])
        yield f'nested{habit}', start + b'<a>' * 4999 + b'x' * 500000 + b'</a>' * 4999
        for name, begin, piece, end in (
                ('attributes', '<a', ' a=""', '/>'), ('empty', '', '<a/>', ''), ('pairs', '', '<a></a>', ''),
                ('open', '<a>x', '<', ''), ('almost', '<' + 'a' * 4000 + '>x', '</' + 'a' * 3999 + 'b', ''),
                ('comment', '', '<!--', ''), ('comments', '', '<!---->', ''), ('doctype', '<!DOCTYPE ', '<', ''),
                ('lines', '<a>', '\r\n', '</a>')):
            yield f'{name}{habit}', repeat(begin, piece, end, start)


def entities():
    for name, piece, end in (('ands', '&', ''), ('far', '&', ';'), ('numbers', '&#65;', ''), ('names', '&eacute;', ''),
                             ('unknown', '&abcdef;', '')):
        yield name, repeat('', piece, end)
    yield 'zeros', repeat('&#', '0', '65;')


def document():
    yield 'names', count('<r>', '<n#/>', '</r>')
    yield 'attributes', count('<r', ' a#=""', '/>')
    for name, piece in (('empty', '<a/>'), ('valued', '<a b="" c="" d=""/>'), ('texts', 'a\n'), ('references', '&lt;'),
                        ('comments', '<!---->'), ('instructions', '<?a?>'), ('deep', '<a>' * 4000 + '</a>' * 4000)):
        yield name, repeat('<r>', piece, '</r>')
    yield 'longname', repeat('<', 'a', '/>')
    yield 'entity', repeat('<!DOCTYPE r [<!ENTITY e "' + 'x' * 60000 + '">]><r>', '&e;', '</r>')
    declared = ''.join(f'<!ATTLIST a a{i} CDATA "xxxxxxxxxxxxxxxxxxxx">' for i in range(2000))
    yield 'declared', repeat(f'<!DOCTYPE r [{declared}]><r>', '<a/>', '</r>')


def xml_archive():
    tree = b'\1'
    yield 'names', count('<r>', '<int name="#" value="1"/>', '</r>', tree)
    yield 'attributes', repeat('<r', ' a=""', '/>', tree)
    yield 'instruction', repeat('<?x', ' a=""', '?><r/>', tree)
    yield 'block', repeat('<r><bin name="b">', '00', '</bin></r>', tree)
    yield 'members', repeat('<r>', '<member name="m"/>', '</r>', tree)
    for kind, value in (('int', '1'), ('float', '1'), ('string', ''), ('list', ''), ('obj', '1')):
        yield f'list-{kind}', repeat(f'<r><list name="l" type="{kind}">', f'<item value="{value}"/>', '</list></r>', tree)
    inner = '<list name="obj" type="obj"><item value="%d"/><item value="%d"/></list>'
    chain = ''.join(f'<obj class="CmArray" ID="{i}">{inner % (i + 1, i + 1)}</obj>' for i in range(9000))
    yield 'chain', tree + f'<r><obj name="o" ID="0"/>{chain}</r>'.encode()


def binary_archive():
    def number(form, value):
        return struct.pack('<' + form, value)

    def entry(kind, room_for):
        return b'\1' + number('i', 1) + number('i', 1) + b'k' + number('H', 2) + number('H', kind) + \
            number('i', SIZE // room_for)
    yield 'ints', entry(2, 8) + bytes(SIZE - 20)
    yield 'texts', entry(4, 4) + bytes(SIZE - 20)
    yield 'trees', entry(5, 4) + bytes(SIZE - 20)
    yield 'block', entry(7, 1) + bytes(SIZE - 20)
    # Each goes in front of all that are there.
    falling = (struct.pack('>I', 0xFFFFFF - i)[1:] for i in range(SIZE // 17))
    yield 'entries', b'\1' + number('i', SIZE // 17) + b''.join(
        number('i', 3) + key + number('H', 1) + number('q', 1) for key in falling)


def object_archive():
    def text(value):
        return struct.pack('<i', len(value) + 1) + value.encode() + b'\0'
    array = struct.pack('<i', -1) + text('CmArray') + struct.pack('<hhi', 0, 2, SIZE)
    strings = struct.pack('<i', -1) + text('CmString') + struct.pack('<h', 0) + struct.pack('<i', 0)
    again = struct.pack('<Ii', 0x80000003, 0)
    yield 'strings', b'\1' + array + strings + again * ((SIZE - 60) // 8)
    yield 'shared', b'\1' + array + strings + struct.pack('<i', 4) * ((SIZE - 60) // 4)
    yield 'arrays', b'\1' + array + struct.pack('<Ihi', 0x80000001, 2, SIZE) * ((SIZE - 60) // 10)


def description():
    begin = '<AudioExportDescription><Application><ProductFamily>Zentor</ProductFamily></Application>' \
            '<Configuration><Publishers><Publisher name="soundcloud"/></Publishers></Configuration>'
    end = '</AudioExportDescription>'
    track = '<Track><Path>/etc/passwd</Path>'
    yield 'empty', repeat(begin, '<Track/>', end)
    yield 'tracks', repeat(begin, track + '</Track>', end)
    yield 'warnings', repeat(begin, track + '<Sharing>x</Sharing><Streamable>x</Streamable></Track>', end)
    for name, before, piece, after in (('keywords', '<MediaKeywords>', '<Keyword>a</Keyword>', '</MediaKeywords>'),
                                       ('tempo', '<MusicalTempo>', 'x,', '</MusicalTempo>'),
                                       ('unknown', '', '<a/>', ''), ('paths', '<UrlArtwork>', '/a', '</UrlArtwork>')):
        yield name, repeat(begin + track + before, piece, after + '</Track>' + end)


def translation():
    new = '<?xml version="1.0" encoding="utf-8"?><T><StringTable>'
    old = '<T><StringTable>'
    end = '</StringTable></T>'
    yield 'new', count(new, '<String key="k#"><de>x</de></String>', end)
    yield 'newtext', repeat(new + '<String key="k"><de>', '\\n', '</de></String>' + end)
    yield 'places', repeat(new + '<String key="', '%s', '"><de>%i</de></String>' + end)
    yield 'old', count(old, '<String Key="k#"><Translation language="de">x</Translation></String>', end)
    for name, piece in (('text', '\\n'), ('ands', '&'), ('pieces', 'a<!---->')):
        yield 'old' + name, repeat(old + '<String Key="k"><Translation language="de">', piece,
                                   '</Translation></String>' + end)


def redirect():
    for name, piece in (('pairs', 'k=v&'), ('ands', '&'), ('hashes', '#'), ('both', 'a=1#b&'), ('equals', '='),
                        ('coded', '%41')):
        yield name, repeat('vlmr://plenar/successfullLogin?', piece)
    for name, key in (('token', 'access_token'), ('error', 'error')):
        yield name, repeat(f'vlmr://plenar/successfullLogin?{key}=', '+')
    yield 'thousand', ('vlmr://plenar/x?' + '&'.join(f'{i}{"k" * 1000}=v' for i in range(999))).encode()


def reply():
    yield 'errors', repeat('<errors>', '<error/>', '</errors>')
    yield 'links', repeat('<track>', '<permalink-url/>', '</track>')
    yield 'text', repeat('<error>', '&lt;', '</error>')


def path():
    for name, piece in (('delimiters', '/'), ('here', './'), ('up', '../'), ('folders', 'a/'), ('colons', ':'),
                        ('foreign', '\\'), ('dots', '.'), ('marks', 'a\u0308')):
        yield name, repeat('/', piece, prefix=b'\0')
    yield 'away', b'\0' + b'../' * (SIZE // 6) + b'\0' + b'/a' * (SIZE // 4)
    yield 'two', b'\0' + b'/a' * (SIZE // 4) + b'\0' + b'/b' * (SIZE // 4)


def url():
    for name, piece in (('delimiters', '/'), ('ats', '@'), ('colons', ':'), ('coded', '%41'), ('percents', '%'),
                        ('folders', 'a/')):
        yield name, repeat('http://h/', piece, prefix=b'\0')
        yield name + '-host', repeat('http://', piece, prefix=b'\0')


def numbers():
    for name, piece in (('digits', '1'), ('dots', '.'), ('exponents', '1e'), ('signs', '-'), ('infinite', 'infi'),
                        ('none', 'na'), ('prefixes', '0x'), ('powers', '0xp'), ('blanks', ' '), ('commas', ','),
                        ('letters', 'x'), ('long', '1' * 200 + 'e')):
        yield name, repeat('', piece)
    yield 'one', repeat('', '1', 'e')


TARGETS = {'xmlparser': xml_parser, 'xmlentities': entities, 'document': document, 'xmlarchive': xml_archive,
           'binaryarchive': binary_archive, 'objectarchive': object_archive, 'exportdescription': description,
           'translation': translation, 'redirect': redirect, 'reply': reply, 'path': path, 'url': url,
           'numbers': numbers}


def main():
    for target, inputs in TARGETS.items():
        folder = pathlib.Path(sys.argv[1]) / target
        folder.mkdir(parents=True, exist_ok=True)
        for name, data in inputs():
            (folder / name).write_bytes(data[:SIZE])


main()
