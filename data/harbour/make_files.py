#!/usr/bin/env python3
"""Writes the picture and text files of the harbour scene (harbour.json).

Stored files (files/) travel inside the objects' storage; volume files (volume/) are found
through the chart database's volume folder. The pictures are small generated images, one
of each format the picture view reads: PNG, BMP, TIFF and a baseline JPEG, plus gdal-data's
own icon when the package is installed. Run it again after changing a picture; the
outputs are committed so that neither the build nor the tests need Python.
"""
import math
import os
import shutil
import struct
import zlib

HERE = os.path.dirname(os.path.abspath(__file__))
FILES = os.path.join(HERE, "files")
VOLUME = os.path.join(HERE, "volume")


def stripes(width, height, colours, band):
    """Rows of (r, g, b) pixels: horizontal bands of the colours, a dark frame."""
    rows = []
    for y in range(height):
        row = []
        for x in range(width):
            if x in (0, width - 1) or y in (0, height - 1):
                row.append((32, 32, 32))
            else:
                row.append(colours[(y // band) % len(colours)])
        rows.append(row)
    return rows


def write_png(path, rows):
    height, width = len(rows), len(rows[0])
    raw = b"".join(b"\x00" + bytes(c for p in row for c in p) for row in rows)

    def chunk(kind, data):
        body = kind + data
        return struct.pack(">I", len(data)) + body + struct.pack(">I", zlib.crc32(body) & 0xFFFFFFFF)

    with open(path, "wb") as f:
        f.write(b"\x89PNG\r\n\x1a\n")
        f.write(chunk(b"IHDR", struct.pack(">IIBBBBB", width, height, 8, 2, 0, 0, 0)))
        f.write(chunk(b"IDAT", zlib.compress(raw, 9)))
        f.write(chunk(b"IEND", b""))


def write_bmp(path, rows):
    height, width = len(rows), len(rows[0])
    stride = (width * 3 + 3) & ~3
    pixels = b""
    for row in reversed(rows):  # bottom-up
        line = bytes(c for (r, g, b) in row for c in (b, g, r))
        pixels += line + b"\x00" * (stride - len(line))
    header = struct.pack("<IiiHHIIiiII", 40, width, height, 1, 24, 0, len(pixels), 2835, 2835, 0, 0)
    with open(path, "wb") as f:
        f.write(b"BM" + struct.pack("<IHHI", 14 + len(header) + len(pixels), 0, 0, 14 + len(header)))
        f.write(header + pixels)


def write_tiff(path, rows):
    """Baseline RGB TIFF, uncompressed, one strip, little-endian."""
    height, width = len(rows), len(rows[0])
    pixels = bytes(c for row in rows for p in row for c in p)
    entries = [  # tag, type, count, value
        (256, 3, 1, width), (257, 3, 1, height), (258, 3, 3, None), (259, 3, 1, 1),
        (262, 3, 1, 2), (273, 4, 1, None), (277, 3, 1, 3), (278, 3, 1, height),
        (279, 4, 1, len(pixels)), (284, 3, 1, 1),
    ]
    ifd_offset = 8
    ifd_size = 2 + 12 * len(entries) + 4
    bits_offset = ifd_offset + ifd_size
    pixels_offset = bits_offset + 6
    ifd = struct.pack("<H", len(entries))
    for tag, kind, count, value in entries:
        if tag == 258:
            value = bits_offset
        if tag == 273:
            value = pixels_offset
        if kind == 3 and count == 1:
            ifd += struct.pack("<HHIHH", tag, kind, count, value, 0)
        else:
            ifd += struct.pack("<HHII", tag, kind, count, value)
    ifd += struct.pack("<I", 0)
    with open(path, "wb") as f:
        f.write(b"II*\x00" + struct.pack("<I", ifd_offset) + ifd + struct.pack("<HHH", 8, 8, 8) + pixels)


# ---- baseline JPEG, one grey component, the standard luminance tables of ITU T.81 annex K
QUANT = [16, 11, 10, 16, 24, 40, 51, 61, 12, 12, 14, 19, 26, 58, 60, 55, 14, 13, 16, 24, 40, 57, 69, 56,
         14, 17, 22, 29, 51, 87, 80, 62, 18, 22, 37, 56, 68, 109, 103, 77, 24, 35, 55, 64, 81, 104, 113, 92,
         49, 64, 78, 87, 103, 121, 120, 101, 72, 92, 95, 98, 112, 100, 103, 99]
ZIGZAG = [0, 1, 8, 16, 9, 2, 3, 10, 17, 24, 32, 25, 18, 11, 4, 5, 12, 19, 26, 33, 40, 48, 41, 34, 27, 20, 13,
          6, 7, 14, 21, 28, 35, 42, 49, 56, 57, 50, 43, 36, 29, 22, 15, 23, 30, 37, 44, 51, 58, 59, 52, 45,
          38, 31, 39, 46, 53, 60, 61, 54, 47, 55, 62, 63]
DC_BITS = [0, 1, 5, 1, 1, 1, 1, 1, 1, 0, 0, 0, 0, 0, 0, 0]
DC_VALUES = list(range(12))
AC_BITS = [0, 2, 1, 3, 3, 2, 4, 3, 5, 5, 4, 4, 0, 0, 1, 0x7D]
AC_VALUES = bytes.fromhex(
    "01020300041105122131410613516107227114328191a1082342b1c11552d1f02433627282090a161718191a25262728292a"
    "3435363738393a434445464748494a535455565758595a636465666768696a737475767778797a838485868788898a9293"
    "9495969798999aa2a3a4a5a6a7a8a9aab2b3b4b5b6b7b8b9bac2c3c4c5c6c7c8c9cad2d3d4d5d6d7d8d9dae1e2e3e4e5e6"
    "e7e8e9eaf1f2f3f4f5f6f7f8f9fa")
assert len(AC_VALUES) == 162 and sum(AC_BITS) == 162


def huffman_codes(bits, values):
    codes, code, k = {}, 0, 0
    for length in range(1, 17):
        for _ in range(bits[length - 1]):
            codes[values[k]] = (code, length)
            code += 1
            k += 1
        code <<= 1
    return codes


class BitWriter:
    def __init__(self):
        self.out, self.buffer, self.count = bytearray(), 0, 0

    def put(self, value, length):
        for i in range(length - 1, -1, -1):
            self.buffer = (self.buffer << 1) | ((value >> i) & 1)
            self.count += 1
            if self.count == 8:
                self.out.append(self.buffer)
                if self.buffer == 0xFF:
                    self.out.append(0)  # byte stuffing
                self.buffer, self.count = 0, 0

    def flush(self):
        while self.count:
            self.put(1, 1)


def category(value):
    magnitude, size = abs(value), 0
    while magnitude:
        magnitude >>= 1
        size += 1
    return size, (value if value >= 0 else value + (1 << size) - 1)


def write_jpeg(path, grey):
    height, width = len(grey), len(grey[0])
    dc_codes, ac_codes = huffman_codes(DC_BITS, DC_VALUES), huffman_codes(AC_BITS, list(AC_VALUES))
    bits, previous = BitWriter(), 0
    for by in range(0, height, 8):
        for bx in range(0, width, 8):
            block = [grey[min(by + y, height - 1)][min(bx + x, width - 1)] - 128 for y in range(8) for x in range(8)]
            coefficients = []
            for v in range(8):
                for u in range(8):
                    total = sum(block[y * 8 + x] * math.cos((2 * x + 1) * u * math.pi / 16) *
                                math.cos((2 * y + 1) * v * math.pi / 16) for y in range(8) for x in range(8))
                    scale = (math.sqrt(0.5) if u == 0 else 1) * (math.sqrt(0.5) if v == 0 else 1)
                    coefficients.append(total * scale / 4)
            quantised = [int(round(coefficients[i] / QUANT[i])) for i in range(64)]
            ordered = [quantised[ZIGZAG[k]] for k in range(64)]
            size, extra = category(ordered[0] - previous)
            previous = ordered[0]
            bits.put(*dc_codes[size])
            bits.put(extra, size)
            run = 0
            for k in range(1, 64):
                if ordered[k] == 0:
                    run += 1
                    continue
                while run > 15:
                    bits.put(*ac_codes[0xF0])
                    run -= 16
                size, extra = category(ordered[k])
                bits.put(*ac_codes[(run << 4) | size])
                bits.put(extra, size)
                run = 0
            if run:
                bits.put(*ac_codes[0x00])
    bits.flush()

    def segment(marker, data):
        return struct.pack(">BBH", 0xFF, marker, len(data) + 2) + data

    with open(path, "wb") as f:
        f.write(b"\xFF\xD8")
        f.write(segment(0xE0, b"JFIF\x00\x01\x01\x00\x00\x01\x00\x01\x00\x00"))
        f.write(segment(0xDB, b"\x00" + bytes(QUANT[ZIGZAG[k]] for k in range(64))))
        f.write(segment(0xC0, struct.pack(">BHHB", 8, height, width, 1) + b"\x01\x11\x00"))
        f.write(segment(0xC4, b"\x00" + bytes(DC_BITS) + bytes(DC_VALUES)))
        f.write(segment(0xC4, b"\x10" + bytes(AC_BITS) + AC_VALUES))
        f.write(segment(0xDA, b"\x01\x01\x00\x00\x3F\x00"))
        f.write(bytes(bits.out))
        f.write(b"\xFF\xD9")


def write_text(path, text, encoding="cp1252"):
    with open(path, "wb") as f:
        f.write(text.replace("\n", "\r\n").encode(encoding))


def main():
    os.makedirs(FILES, exist_ok=True)
    os.makedirs(os.path.join(VOLUME, "PICS"), exist_ok=True)
    red, green, white, black, yellow = (220, 30, 30), (20, 150, 60), (245, 245, 245), (20, 20, 20), (240, 200, 20)
    write_png(os.path.join(FILES, "beacon.png"), stripes(24, 48, [green, white], 8))
    write_bmp(os.path.join(VOLUME, "PICS", "buoy.bmp"), stripes(40, 30, [red, white], 6))
    write_tiff(os.path.join(VOLUME, "lighthouse.tif"), stripes(20, 60, [white, red], 10))
    tower = [[200 if abs(x - 16) < 4 + y // 8 else 90 for x in range(32)] for y in range(32)]
    write_jpeg(os.path.join(FILES, "tower.jpg"), tower)
    write_png(os.path.join(FILES, "cardinal.png"), stripes(24, 48, [black, yellow, black], 16))
    icon = "/usr/share/gdal/gdalicon.png"
    if os.path.exists(icon):
        shutil.copyfile(icon, os.path.join(FILES, "gdalicon.png"))
    write_text(os.path.join(FILES, "beacon.txt"),
               "Port-hand lateral beacon on the Plateau des Fillettes.\n"
               "Keep it to port when entering the Goulet de Brest.\n")
    write_text(os.path.join(FILES, "balise.txt"),
               "Balise lat\u00e9rale b\u00e2bord du plateau des Fillettes.\n"
               "La laisser \u00e0 b\u00e2bord en entrant dans le Goulet de Brest.\n")
    write_text(os.path.join(VOLUME, "notes.txt"),
               "Volume copy of the harbour notes: a text file found in the chart database's folder.\n")
    write_text(os.path.join(FILES, "empty.txt"), "")


if __name__ == "__main__":
    main()
