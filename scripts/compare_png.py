#!/usr/bin/env python3
"""Compares two PNG images (8-bit RGB or RGBA, as qorhost writes them) pixel by pixel.

    compare_png.py ACTUAL GOLDEN [TOLERANCE]

Exit code 0 when they have the same size and no channel differs by more than TOLERANCE (default 2,
as the test suite's golden images); otherwise 1, with the count of differing pixels and the first.
"""
import struct
import sys
import zlib


def read_png(path):
    with open(path, "rb") as f:
        data = f.read()
    if data[:8] != b"\x89PNG\r\n\x1a\n":
        sys.exit(f"{path}: not a PNG file")
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
    if depth != 8 or colour not in (2, 6) or interlace:
        sys.exit(f"{path}: only 8-bit RGB or RGBA without interlace is read")
    channels = 4 if colour == 6 else 3
    raw, stride = zlib.decompress(idat), width * channels
    rows, previous = [], bytearray(stride)
    for y in range(height):
        kind, line = raw[y * (stride + 1)], bytearray(raw[y * (stride + 1) + 1:(y + 1) * (stride + 1)])
        for i in range(stride):
            left = line[i - channels] if i >= channels else 0
            up, up_left = previous[i], previous[i - channels] if i >= channels else 0
            if kind == 1:
                line[i] = (line[i] + left) & 255
            elif kind == 2:
                line[i] = (line[i] + up) & 255
            elif kind == 3:
                line[i] = (line[i] + (left + up) // 2) & 255
            elif kind == 4:
                p = left + up - up_left
                pa, pb, pc = abs(p - left), abs(p - up), abs(p - up_left)
                line[i] = (line[i] + (left if pa <= pb and pa <= pc else up if pb <= pc else up_left)) & 255
        rows.append(line)
        previous = line
    # Every pixel as RGBA.
    pixels = []
    for line in rows:
        for x in range(width):
            pixel = tuple(line[x * channels:(x + 1) * channels])
            pixels.append(pixel if channels == 4 else pixel + (255,))
    return width, height, pixels


def main():
    if len(sys.argv) not in (3, 4):
        sys.exit(__doc__)
    tolerance = int(sys.argv[3]) if len(sys.argv) == 4 else 2
    (w, h, actual), (gw, gh, golden) = read_png(sys.argv[1]), read_png(sys.argv[2])
    if (w, h) != (gw, gh):
        print(f"size {w}x{h}, golden {gw}x{gh}")
        return 1
    differing = [i for i, (a, g) in enumerate(zip(actual, golden))
                 if max(abs(x - y) for x, y in zip(a, g)) > tolerance]
    if differing:
        first = differing[0]
        print(f"{len(differing)} pixels differ; the first at ({first % w}, {first // w}): "
              f"{actual[first]}, golden {golden[first]}")
        return 1
    return 0


if __name__ == "__main__":
    sys.exit(main())
