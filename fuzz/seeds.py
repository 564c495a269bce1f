#!/usr/bin/env python3
"""Writes the seed corpora (corpus/<target>/): a few hand-made inputs per
target, in the byte layout its FuzzInput reads, that reach the interesting
paths at once. Run again after changing a target's input layout."""
import os
import struct

SPECIAL = {'0': 0, '-0': 1, '1': 2, '-1': 3, 'nan': 4, 'inf': 5, '-inf': 6, 'huge': 7,
           '-huge': 8, 'past_float': 9, 'int_max+1': 11, 'tiny': 13}


def u16(v):
    return struct.pack('>H', v)


def num(v):
    """A Double(): a special value by name, a quarter step in -512..512, else raw."""
    if isinstance(v, str):
        return bytes([SPECIAL[v]])
    if -512 <= v <= 512 and v * 4 == int(v * 4):
        return bytes([100]) + u16(int(v * 4) + 2048)
    return bytes([200]) + struct.pack('<d', v)


def side(v):
    """A Side(): one byte below 64, else a marker byte and the full range."""
    return bytes([v]) if v < 64 else bytes([0xC0]) + u16(v)


def nums(values):
    return b''.join(num(v) for v in values)


def image(bg=(230, 230, 230), shapes=(), noise=3):
    """Bytes of SyntheticImage after its size: background, shapes, noise."""
    out = bytes(bg) + bytes([len(shapes)])
    for (ax, ay, bx, by, colour, kind, extra) in shapes:
        out += u16(ax) + u16(ay) + u16(bx) + u16(by) + bytes(colour) + bytes([kind]) + bytes(extra)
    return out + bytes([noise])


TEXT = [(10, 40, 0, 0, (20, 20, 20), 2, (4, 1)), (60, 45, 0, 0, (30, 10, 10), 2, (3, 2))]


def inpainting(rows, cols, channel_pick, values, shapes=TEXT):
    return side(rows) + side(cols) + bytes([channel_pick, len(values)]) + nums(values) + image(
        shapes=shapes)


def statistics(rows, cols, channel_pick, as_float, values, skew=0):
    return (side(rows) + side(cols) + bytes([channel_pick, 1 if as_float else 3, len(values)]) +
            nums(values) + bytes([skew]) + image(shapes=TEXT))


def tracker(rows, cols, rects, moves, layout=0):
    out = u16(rows) + u16(cols) + bytes([layout, len(rects)])
    for r in rects:
        out += nums(r)
    out += bytes([len(moves) - 1]) + image(shapes=TEXT, noise=2)
    for (angle, scale, dx, dy, noise) in moves:
        out += bytes([8]) + struct.pack('bbbbB', angle, scale, dx, dy, noise)
    return out


def array(values, encode):
    return bytes([len(values)]) + b''.join(encode(v) for v in values)


def mapping(rects, orientation_pick, fitted, count, absent=()):
    """frame_mapping: seven arrays, orientation, view, text count."""
    def arr(name, values, encode):
        return b'\xff' if name in absent else array(values, encode)
    n = len(rects)
    out = arr('patch', [v for r in rects for v in r], num)
    out += arr('text', [v for r in rects for v in r], num)
    out += arr('ids', list(range(n)), lambda i: u16(i) + b'\x00')
    out += arr('addrs', [1 + i % 6 for i in range(n)], lambda a: bytes([a]))
    out += arr('scales', [1.0, 0.5, 'nan'] * n, num)
    out += arr('shifts', [10.0, -20.0, 'inf'] * n, num)
    out += arr('colours', [0] * n, lambda c: u16(0xFF00) + u16(0x10FF))
    out += bytes([orientation_pick])
    if fitted:
        out += b'\x01' + u16(1080 + 2) + u16(1920 + 2) + u16(640 + 2) + u16(480 + 2)
    else:
        out += b'\x00' + nums([800, 600, 640, 480, -1, 0.5, 1, -0.5])
    return out + bytes([count]) + b'\x01' * count + num(-725.5) + b'\x05'


def text(face, width, align, spacing, reference, utf8, repeat=0):
    head = bytes([face, width, align, spacing & 0xFF, reference])
    head += bytes([0, repeat]) if repeat else bytes([1])  # repeat: copies - 1
    return head + utf8.encode('utf-8', 'surrogatepass') if isinstance(utf8, str) else head + utf8


def reader(rows, cols, channel_pick, sixteen_bit, setting, shapes=TEXT, bg=(230, 230, 230)):
    """text_reader: size, channels (3, 1, 4), 16-bit, reader setting, then the image."""
    return side(rows) + side(cols) + bytes([channel_pick, 0 if sixteen_bit else 1, setting]) + image(
        bg=bg, shapes=shapes)


BIG_TEXT = [(20, 60, 0, 0, (10, 10, 10), 2, (7, 2)), (20, 140, 0, 0, (200, 30, 30), 2, (5, 1))]


SEEDS = {
    'inpainting_request': {
        'one-line': inpainting(60, 120, 0, [60, 30, 100, 24, 0]),
        'two-lines-turned': inpainting(120, 160, 0, [80, 40, 120, 30, 10, 70, 90, 90, 20, -80]),
        'seven-values': inpainting(60, 120, 0, [60, 30, 100, 24, 0, 1, 2]),
        'odd-values': inpainting(50, 50, 0, ['nan', 25, 'inf', 10, 0, 25, 25, 'huge', -3, 1e9]),
        'outside-and-negative': inpainting(80, 80, 0, [-40, 200, 30, -10, 45, 400, 400, 40, 40, 0]),
        'grey-image': inpainting(40, 90, 1, [45, 20, 60, 20, 0]),
        'tiny-image': inpainting(3, 300, 0, [150, 1, 100, 3, 0]),
    },
    'color_statistics': {
        'two-rects': statistics(100, 150, 0, False, [100, 100, 40, 20, 0, 200, 80, 60, 30, 30]),
        'float-grey': statistics(60, 60, 1, True, [60, 60, 40, 40, 15, 1, 2]),
        'odd-values': statistics(30, 30, 2, False, ['nan', 'inf', 'huge', '-huge', 0, 10, 10,
                                                    'past_float', 5, 'tiny']),
        'means-too-long': statistics(30, 30, 0, False, [20, 20, 10, 10, 0], skew=1),
    },
    'tracker': {
        'two-regions-drift': tracker(80, 96, [[30, 30, 40, 14, 0], [60, 55, 50, 16, 5]],
                                     [(2, 1, 8, -4, 3), (4, 2, 16, -8, 3), (-3, 0, 4, 4, 6)]),
        'odd-regions': tracker(64, 64, [['nan', 30, 20.9, 10.5, 0], [32, 32, 'inf', 10, 'huge'],
                                        [32, 32, -20, 8, 1e9]], [(0, 0, 0, 0, 0)]),
        'empty-frame': tracker(0, 40, [[10, 10, 10, 10, 0]], [(0, 0, 0, 0, 0)]),
        'grey-frame': tracker(40, 40, [[20, 20, 20, 10, 0]], [(0, 0, 1, 1, 0)], layout=240),
    },
    'frame_mapping': {
        'two-texts-fitted': mapping([[320, 240, 200, 40, 0], [100, 400, 80, 30, 90]], 0, True, 2),
        'portrait-odd-values': mapping([['nan', 'inf', 1e9, -5, 'huge']], 1, False, 1),
        'short-and-absent': mapping([[10, 10, 10, 10, 10]], 3, True, 5, absent=('text', 'scales')),
        'upside-down': mapping([[1, 2, 3, 4, 181], [5, 6, 7, 8, -181]], 2, False, 2),
    },
    'text_layout': {
        'latin-wrapped': text(0, 40, 0, 0, 0, 'The quick brown fox jumps over the lazy dog'),
        'arabic-mixed': text(1, 24, 2, 4, 0, 'مرحبا بالعالم 123 abc السلام'),
        'hebrew-marks': text(0, 0, 1, -8, 0, 'שָׁלוֹם a\u0301\u0302\u0303\u0304 q\u0308\u200dy'),
        'cjk-reference': text(2, 12, 1, 0, 1, '東京都の天気は晴れ。中文测试，日本語テキスト'),
        'invalid-utf8': text(0, 8, 0, 0, 0, b'a\xff\xc0\xaf\xed\xa0\x80\xf4\x90\x80\x80ab\xe4\xb8'),
        'controls-breaks': text(2, 6, 2, 2, 1, 'a\r\nb\u2028c\u0085d\u0007\u202ee\u202cf \t\u3000'),
        'long-repeated': text(1, 3, 0, 0, 0, 'كلمة word 字 ', repeat=40),
    },
    'text_reader': {
        'text-rgb': reader(200, 300, 0, False, 0, shapes=BIG_TEXT),
        'text-rgba-boxes': reader(180, 260, 2, False, 2, shapes=BIG_TEXT, bg=(250, 250, 200)),
        'tiny-detector': reader(120, 400, 0, False, 1, shapes=BIG_TEXT),
        'one-pixel': reader(1, 1, 0, False, 0, shapes=()),
        'thin-strip': reader(2, 400, 2, False, 0, shapes=TEXT),
        'empty': reader(0, 50, 0, False, 0, shapes=()),
        'grey-refused': reader(60, 60, 1, False, 0),
        'sixteen-bit-refused': reader(60, 60, 0, True, 0),
    },
}

# Inputs of past findings that are easier to state than to keep as the
# fuzzer wrote them (the others in regressions/ are the fuzzer's own).
REGRESSIONS = {
    'color_statistics': {
        # Half a rectangle 2^31 px tall: the mask fill walked ~10^9 rows.
        'mask-fill-walks-rows-above-huge-rect': statistics(100, 150, 0, False,
                                                           [100, 0, 40, 'int_max+1', 0]),
    },
    'text_layout': {
        # 2,000 characters, one per line and per run: quadratic line collection.
        'quadratic-line-collection-alternating-scripts': text(2, 1, 0, 0, 0, 'a字' * 250,
                                                              repeat=7),
    },
}


def write(kind, table):
    here = os.path.dirname(os.path.abspath(__file__))
    for target, inputs in table.items():
        folder = os.path.join(here, kind, target)
        os.makedirs(folder, exist_ok=True)
        for name, data in inputs.items():
            with open(os.path.join(folder, name), 'wb') as f:
                f.write(data)


if __name__ == '__main__':
    write('corpus', SEEDS)
    write('regressions', REGRESSIONS)
