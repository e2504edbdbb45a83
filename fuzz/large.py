#!/usr/bin/env python3
"""Writes inputs of 1 MiB that repeat one thing, each to cost a reader the most: fuzz/large.py FOLDER.

FOLDER gets a folder for each target. scripts/fuzz --large runs the targets over them and tells time and memory.
"""
import pathlib
import struct
import sys
import zlib

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
    yield 'joined', b'\0' + b'a/' * (SIZE // 2 - 8) + b'\0/b'
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


def datagrams():
    for name, piece in (('blanks', ' '), ('coded', '%20'), ('words', 'a 1 '), ('digits', '1')):
        yield name, repeat('pock...pock...VELLAMOOR ', piece)


def deflate():
    def packed(how, content):
        return bytes([how]) + zlib.compress(content, 9)
    yield 'small', b'\2' + b'\x78\xda' + b'\0\0\0\xff\xff' * (SIZE // 5 - 1)
    yield 'bomb', packed(0, bytes(1 << 26))
    yield 'bombsmall', packed(2, bytes(1 << 26))
    yield 'zeros', b'\xff' + bytes(SIZE - 1)
    yield 'mixed', b'\xfd' + b''.join(struct.pack('<I', i * 2654435761 & 0xffffffff) for i in range(SIZE // 4 - 1))
    yield 'repeated', b'\xff' + (b'a' * 257 + b'b') * (SIZE // 258)


def http_reply():
    begin = '0HTTP/1.1 200 OK\r\n'
    yield 'lines', repeat(begin, 'a: b\r\n', '\r\n')
    yield 'names', count(begin, 'a#: b\r\n', '\r\n')
    for name, piece in (('long', 'a'), ('blanks', ' '), ('folded', '\r\n a')):
        yield name, repeat(begin + 'a: ', piece, '\r\n\r\n')
    yield 'returns', repeat('0', '\r', '\n')
    yield 'ends', repeat('0', '\n')
    yield 'continued', repeat('0', 'HTTP/1.1 100 Continue\r\n\r\n', 'HTTP/1.1 200 OK\r\n\r\n')
    yield 'chunks', repeat(begin + 'Transfer-Encoding: chunked\r\n\r\n', '1\r\na\r\n', '0\r\n\r\n')
    yield 'chunkdigits', repeat(begin + 'Transfer-Encoding: chunked\r\n\r\n', '0', '1\r\na\r\n')
    yield 'body', repeat(begin + '\r\n', 'a')
    yield 'redirected', repeat('0', 'HTTP/1.1 301 x\r\nLocation: /a\r\n\r\n\x1e', '')
    yield 'farredirected', repeat('0HTTP/1.1 301 x\r\nLocation: http://h/', '%41/', '\r\n\r\n\x1eHTTP/1.1 200 OK\r\n\r\n')
    for name, piece in (('asked', 'Basic realm="a", '), ('quoted', '"\\"')):
        yield name, repeat('0HTTP/1.1 401 x\r\nWWW-Authenticate: ', piece, '\r\n\r\n\x1eHTTP/1.1 200 OK\r\n\r\n')


def net_messages():
    def text(value):
        return struct.pack('<i', len(value) + 1) + value + b'\0'

    def message(values, number):
        return text(b'inbox') + struct.pack('<i', 0) + text(b'kinds') + struct.pack('<i', number) + values
    integer = b''.join(text(b'%x' % -i) + struct.pack('<hq', 1, 1) for i in range(-SIZE // 20, 0))
    yield 'values', message(integer, SIZE // 20)
    yield 'same', message((text(b'a') + struct.pack('<hq', 1, 1)) * (SIZE // 16 - 4), SIZE // 16 - 4)
    first = text(b'l') + struct.pack('<hi', 18, -1) + text(b'CmArray') + struct.pack('<hhi', 0, 2, 60000)
    string = struct.pack('<i', -1) + text(b'CmString') + struct.pack('<h', 0) + text(b'a')
    yield 'many', message(first + string + (struct.pack('<I', 0x80000003) + text(b'a')) * 59999, 1)
    yield 'shared', message(first + string + struct.pack('<i', 4) * 59999, 1)
    tree = struct.pack('<i', -1) + text(b'FAttributes') + struct.pack('<hi', 0, SIZE // 17)
    yield 'tree', message(text(b't') + struct.pack('<h', 18) + tree + integer, 1)


def older_presets():
    def text(value, mark=b'\xef\xbb\xbf'):
        return struct.pack('<i', len(value) + 1 + len(mark)) + value + b'\0' + mark

    def known(name):
        return text(name, b'') + struct.pack('<h', 0)
    start = struct.pack('<ii', 1, -2) + known(b'FPresetItem') + struct.pack('<i', -2) + known(b'CmObject') + \
        struct.pack('<i', -1) + known(b'FPresetList')
    string = struct.pack('<i', -1) + known(b'CmString') + struct.pack('<i', 8) + text(b'')
    first = struct.pack('<i', -1) + known(b'FPreset')
    body = text(b'One') + string + struct.pack('<i', 3)
    first += struct.pack('<i', len(body)) + body
    names = text(b'id') + text(b'Name')
    at = len(start) + 4 + len(names) + 4
    class_of_string = at + first.index(b'\xff\xff\xff\xff', 4)
    again_body = text(b'One') + struct.pack('<Ii', 0x80000000 + class_of_string, 8) + text(b'') + struct.pack('<i', 3)
    again = struct.pack('<Ii', 0x80000000 + at, len(again_body)) + again_body
    number = (SIZE - at - len(first)) // len(again)
    items = names + struct.pack('<i', number + 1) + first + again * number
    yield 'presets', start + struct.pack('<i', len(items)) + items
    yield 'huge', start + struct.pack('<i', SIZE) + names + struct.pack('<i', 0x7fffffff) + first + again * number
    level = 0x80000000 + start.index(b'\xff\xff\xff\xff')
    nested = struct.pack('<Ii', level, SIZE) + names + struct.pack('<i', 1)
    yield 'nested', start + struct.pack('<i', SIZE) + names + struct.pack('<i', 1) + nested * (SIZE // len(nested) - 4)


def preset_file():
    begin = '<?xml version="1.0" encoding="utf-8"?><Presets><rootObjects><root name="Pool" ID="1"/></rootObjects>' \
            '<obj class="FPresetPool" name="Pool" ID="1"><list name="Lists" type="list">'
    item = '<item><string name="ID" value="#"/><list name="Items" type="obj">'
    yield 'lists', count(begin, item + '</list></item>', '</list></obj></Presets>')
    body = begin + item + ''.join(f'<item value="{i + 2}"/>' for i in range(11000)) + '</list></item></list></obj>'
    preset = '<obj class="FPreset" ID="%d"><string name="Name" value="a"/></obj>'
    yield 'presets', (body + ''.join(preset % (i + 2) for i in range(11000)) + '</Presets>').encode()
    same = begin + item + '<item value="2"/>' * 50000 + '</list></item></list></obj>'
    yield 'same', (same + preset % 2 + '</Presets>').encode()
    chain = '<obj class="FPresetList" ID="%d"><string name="ID" value="a"/><list name="Items" type="obj">' \
            '<item value="%d"/><item value="%d"/></list></obj>'
    inner = ''.join(chain % (i, i + 1, i + 1) for i in range(2, 6500))
    yield 'chain', (begin + item + '<item value="2"/></list></item></list></obj>' + inner + '</Presets>').encode()


def resource_file():
    def file(entries, number, content=b''):
        ending = struct.pack('<iii', len(entries), number, 16) + b'QZRF'
        return b'Vellamoor Resource File\r\n' + content + entries + ending

    def entry(name, kind=2, offset=0, size=0):
        return struct.pack('<iii', kind, offset, size) + name + b'\0'
    number = SIZE // 20
    yield 'files', file(b''.join(entry(b'%x' % i) for i in range(number)), number)
    yield 'falling', file(b''.join(entry(b'%x' % (0xfffff - i)) for i in range(number)), number)
    yield 'same', file(entry(b'a') * (SIZE // 15), SIZE // 15)
    yield 'long', file(b''.join(entry(b'a' * 240 + b'%x' % i) for i in range(4000)), 4000)
    for name, depth in (('deep', 127), ('deeper', 30000)):
        folders = entry(b'a', 1) * depth + entry(b'..', 1) * depth
        times = SIZE // len(folders) or 1
        yield name, file(folders * times, 2 * depth * times)
    inside = entry(b'a', 1) * 127 + b''.join(entry(b'%x' % i) for i in range(60000)) + entry(b'..', 1) * 127
    yield 'deepfiles', file(inside, 60254)
    full = b''.join(entry(b'%x' % i, 2, 25 + i, 1) for i in range(50000))
    yield 'content', file(full, 50000, bytes(50000))
    yield 'overlapping', file(b''.join(entry(b'%x' % i, 2, 25, 200000) for i in range(40000)), 40000, bytes(200000))


def stream():
    for name, start, piece in (('writes', '\0\0\2', '\x3e\0'), ('reads', '\0\0\2', '\x3d\0'),
                               ('far', '\0\0\2', '\0\2\x0f\xff\x02\0')):
        yield name, repeat(start, piece)


# The limits of these targets on one text stand in for those of their callers.
def string_match():
    pattern = b'ab' * 99
    for name, text in (('similar', b'ba' * 99), ('part', b'a' + pattern * 2), ('whole', pattern.upper())):
        yield name, pattern + b'\0' + text


def tokens():
    for name, piece in (('delimiters', ','), ('tokens', 'a,'), ('one', 'a')):
        yield name, repeat('123456789,\0.,\0', piece)


def wildcard():
    for name, piece in (('stars', '*a'), ('marks', '?'), ('escapes', '\\\\'), ('letters', 'a')):
        yield name, b'\0' + piece.encode() * (1998 // len(piece)) + b'\0' + b'a' * 2000


TARGETS = {'xmlparser': xml_parser, 'xmlentities': entities, 'document': document, 'xmlarchive': xml_archive,
           'binaryarchive': binary_archive, 'objectarchive': object_archive, 'exportdescription': description,
           'translation': translation, 'redirect': redirect, 'reply': reply, 'path': path, 'url': url,
           'numbers': numbers, 'datagrams': datagrams, 'deflate': deflate, 'httpreply': http_reply,
           'netmessages': net_messages, 'olderpresets': older_presets, 'presetfile': preset_file,
           'resourcefile': resource_file, 'stream': stream, 'stringmatch': string_match, 'tokens': tokens,
           'wildcard': wildcard}


def main():
    for target, inputs in TARGETS.items():
        folder = pathlib.Path(sys.argv[1]) / target
        folder.mkdir(parents=True, exist_ok=True)
        for name, data in inputs():
            (folder / name).write_bytes(data[:SIZE])


main()
