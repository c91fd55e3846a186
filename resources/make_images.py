#!/usr/bin/env python3
"""Writes the module's cursor and bitmap resources into resources/images/.

They are simple generated images, not artwork: a crosshair cursor (group 203) and image
strips of 16 x 16 glyphs on a light-grey (C0C0C0) mask colour for bitmaps 204..210 and
IDB_TVINFO_PORT_COLOR_NEW. Run it again after changing a glyph; the outputs are committed
so that the build needs no Python.
"""
import os
import struct

HERE = os.path.dirname(os.path.abspath(__file__))
OUT = os.path.join(HERE, "images")
MASK = (0xC0, 0xC0, 0xC0)
SIZE = 16


def write_cursor(path, size=32, hotspot=(15, 15)):
    cx, cy = hotspot
    # 'B' black line, 'W' white outline, None transparent; 1 bit per pixel, AND + XOR masks.
    pix = [[None] * size for _ in range(size)]
    for i in range(size):
        gap = abs(i - cx) <= 2
        if not gap:
            pix[cy][i] = "B"
            pix[i][cx] = "B"
    for y in range(size):
        for x in range(size):
            if pix[y][x] is None:
                near = any(0 <= y + dy < size and 0 <= x + dx < size and pix[y + dy][x + dx] == "B"
                           for dy in (-1, 0, 1) for dx in (-1, 0, 1))
                if near:
                    pix[y][x] = "W"
    stride = size // 8
    xor_rows, and_rows = [], []
    for y in reversed(range(size)):  # bottom-up
        xor_row, and_row = bytearray(stride), bytearray(stride)
        for x in range(size):
            bit = 0x80 >> (x % 8)
            p = pix[y][x]
            if p is None:
                and_row[x // 8] |= bit
            elif p == "W":
                xor_row[x // 8] |= bit
        xor_rows.append(bytes(xor_row))
        and_rows.append(bytes(and_row))
    header = struct.pack("<IiiHHIIiiII", 40, size, size * 2, 1, 1, 0, 0, 0, 0, 2, 0)
    palette = bytes([0, 0, 0, 0, 255, 255, 255, 0])
    image = header + palette + b"".join(xor_rows) + b"".join(and_rows)
    entry = struct.pack("<BBBBHHII", size, size, 2, 0, cx, cy, len(image), 6 + 16)
    with open(path, "wb") as f:
        f.write(struct.pack("<HHH", 0, 2, 1) + entry + image)


def write_bmp(path, width, height, pixel):
    stride = (width * 3 + 3) & ~3
    rows = []
    for y in reversed(range(height)):
        row = bytearray()
        for x in range(width):
            r, g, b = pixel(x, y)
            row += bytes([b, g, r])
        row += bytes(stride - len(row))
        rows.append(bytes(row))
    data = b"".join(rows)
    info = struct.pack("<IiiHHIIiiII", 40, width, height, 1, 24, 0, len(data), 2835, 2835, 0, 0)
    head = struct.pack("<2sIHHI", b"BM", 14 + len(info) + len(data), 0, 0, 14 + len(info))
    with open(path, "wb") as f:
        f.write(head + info + data)


def strip(path, glyphs):
    """glyphs: functions (x, y) -> colour or None (mask), one per 16 x 16 image."""
    def pixel(x, y):
        c = glyphs[x // SIZE](x % SIZE, y)
        return MASK if c is None else c
    write_bmp(path, SIZE * len(glyphs), SIZE, pixel)


def plus(colour):
    return lambda x, y: colour if (6 <= x <= 9 and 2 <= y <= 13) or (6 <= y <= 9 and 2 <= x <= 13) else None


def minus(colour):
    return lambda x, y: colour if 6 <= y <= 9 and 2 <= x <= 13 else None


def arrow(colour, left):
    def f(x, y):
        dx = (13 - x) if left else (x - 2)
        return colour if 0 <= dx <= 11 and abs(y - 7.5) <= dx / 2 + 0.5 and dx <= 11 else None
    return f


def frame_box(colour):
    return lambda x, y: colour if (2 <= x <= 13 and 3 <= y <= 12) and (
        x in (2, 13) or y in (3, 4, 12)) else None


def dot(colour):
    return lambda x, y: colour if (x - 7.5) ** 2 + (y - 7.5) ** 2 <= 30 else None


def square(colour):
    return lambda x, y: colour if 3 <= x <= 12 and 3 <= y <= 12 else None


BLACK, GREY = (0, 0, 0), (0x80, 0x80, 0x80)
PALETTE = [(0x00, 0x00, 0x80), (0x00, 0x80, 0x00), (0x80, 0x00, 0x00), (0x00, 0x80, 0x80),
           (0x80, 0x00, 0x80), (0x80, 0x80, 0x00), (0xFF, 0x00, 0x00), (0x00, 0x00, 0xFF)]


def main():
    os.makedirs(OUT, exist_ok=True)
    write_cursor(os.path.join(OUT, "crosshair.cur"))
    # 204: picture tool bar; zoom in 0/8, zoom out 1/9, previous 4/6, next 5/7, picture box 10/11.
    strip(os.path.join(OUT, "picture_toolbar.bmp"), [
        plus(BLACK), minus(BLACK), dot(GREY), dot(GREY), arrow(BLACK, True), arrow(BLACK, False),
        arrow(GREY, True), arrow(GREY, False), plus(GREY), minus(GREY), frame_box(BLACK), frame_box(GREY)])
    # 205..210: image strips of coloured marks for the controls' lists and trees.
    for number in range(205, 211):
        k = number - 205
        glyphs = [(dot if i % 2 == 0 else square)(PALETTE[(i + k) % len(PALETTE)]) for i in range(8)]
        strip(os.path.join(OUT, "strip%d.bmp" % number), glyphs)
    # IDB_TVINFO_PORT_COLOR_NEW: tree icons 0..30 and their marked forms (up to 124).
    glyphs = [(square if i >= 31 else dot)(PALETTE[i % len(PALETTE)]) for i in range(125)]
    strip(os.path.join(OUT, "tvinfo_port_color_new.bmp"), glyphs)


if __name__ == "__main__":
    main()
