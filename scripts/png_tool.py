#!/usr/bin/env python3
"""Reads the PNG screenshots of the browser test and the README with the standard library alone.

png_tool.py ink FILE R,G,B     prints the share of pixels that are not white and the number of
                               pixels of colour R,G,B ("ink=0.1234 colour=5678")
png_tool.py crop FILE OUT TOP HEIGHT
                               writes rows TOP to TOP+HEIGHT-1 of FILE to OUT
"""
import struct
import sys
import zlib


def read_png(path):
    with open(path, "rb") as f:
        data = f.read()
    if data[:8] != b"\x89PNG\r\n\x1a\n":
        raise ValueError(path + ": not a PNG file")
    pos, idat, header = 8, b"", None
    while pos < len(data):
        length, kind = struct.unpack(">I4s", data[pos:pos + 8])
        body = data[pos + 8:pos + 8 + length]
        if kind == b"IHDR":
            header = struct.unpack(">IIBBBBB", body)
        elif kind == b"IDAT":
            idat += body
        pos += 12 + length
    width, height, depth, colour, _, _, interlace = header
    channels = {2: 3, 6: 4}.get(colour)
    if depth != 8 or channels is None or interlace != 0:
        raise ValueError(path + ": only 8-bit RGB or RGBA, not interlaced")
    raw = zlib.decompress(idat)
    stride = width * channels
    rows, prev = [], bytearray(stride)
    for y in range(height):
        start = y * (stride + 1)
        kind, line = raw[start], bytearray(raw[start + 1:start + 1 + stride])
        for i in range(stride):
            a = line[i - channels] if i >= channels else 0
            b = prev[i]
            c = prev[i - channels] if i >= channels else 0
            if kind == 1:
                line[i] = (line[i] + a) & 0xFF
            elif kind == 2:
                line[i] = (line[i] + b) & 0xFF
            elif kind == 3:
                line[i] = (line[i] + (a + b) // 2) & 0xFF
            elif kind == 4:
                p = a + b - c
                pa, pb, pc = abs(p - a), abs(p - b), abs(p - c)
                pred = a if pa <= pb and pa <= pc else (b if pb <= pc else c)
                line[i] = (line[i] + pred) & 0xFF
        rows.append(bytes(line))
        prev = line
    return width, height, channels, rows


def write_png(path, width, channels, rows):
    raw = b"".join(b"\x00" + row for row in rows)
    colour = 6 if channels == 4 else 2

    def chunk(kind, body):
        return (struct.pack(">I", len(body)) + kind + body +
                struct.pack(">I", zlib.crc32(kind + body) & 0xFFFFFFFF))

    with open(path, "wb") as f:
        f.write(b"\x89PNG\r\n\x1a\n")
        f.write(chunk(b"IHDR", struct.pack(">IIBBBBB", width, len(rows), 8, colour, 0, 0, 0)))
        f.write(chunk(b"IDAT", zlib.compress(raw, 9)))
        f.write(chunk(b"IEND", b""))


def main(args):
    if len(args) == 3 and args[0] == "ink":
        width, height, channels, rows = read_png(args[1])
        colour = bytes(int(v) for v in args[2].split(","))
        ink = match = 0
        for row in rows:
            for x in range(0, width * channels, channels):
                pixel = row[x:x + 3]
                ink += pixel != b"\xff\xff\xff"
                match += pixel == colour
        print("ink=%.4f colour=%d" % (ink / float(width * height), match))
        return 0
    if len(args) == 5 and args[0] == "crop":
        width, height, channels, rows = read_png(args[1])
        top, count = int(args[3]), int(args[4])
        write_png(args[2], width, channels, rows[top:top + count])
        return 0
    sys.stderr.write(__doc__)
    return 2


if __name__ == "__main__":
    sys.exit(main(sys.argv[1:]))
