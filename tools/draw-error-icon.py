#!/usr/bin/env python3
"""Draws the error dialog's icon (a red disc with a white cross, 16 and 32 pixels)
as a Windows .ico file: qomfcext/res/error.ico."""
import math
import struct
import sys


def pixel(size, x, y):
    c = (size - 1) / 2.0
    r = size / 2.0 - 0.5
    # Four samples per pixel for smooth edges.
    disc = cross = 0.0
    for sx in (0.25, 0.75):
        for sy in (0.25, 0.75):
            px, py = x + sx - 0.5, y + sy - 0.5
            d = math.hypot(px - c, py - c)
            if d <= r:
                disc += 0.25
                # The cross: two bars along the diagonals, inside 55% of the radius.
                u, v = px - c, py - c
                w = size * 0.09
                if max(abs(u), abs(v)) <= r * 0.55 and (abs(u - v) <= w * 1.41 or abs(u + v) <= w * 1.41):
                    cross += 0.25
    if disc == 0:
        return (0, 0, 0, 0)
    red = (0xC8, 0x1E, 0x1E)
    shade = 1.0 - 0.25 * (y / size)  # slightly darker towards the bottom
    base = tuple(int(ch * shade) for ch in red)
    f = cross / disc
    rgb = tuple(int(b * (1 - f) + 255 * f) for b in base)
    return rgb + (int(255 * disc),)


def image(size):
    rows = []
    for y in reversed(range(size)):  # bottom-up
        row = b""
        for x in range(size):
            r, g, b, a = pixel(size, x, y)
            row += bytes((b, g, r, a))
        rows.append(row)
    xor = b"".join(rows)
    mask_row = ((size + 31) // 32) * 4
    mask = b""
    for y in reversed(range(size)):
        bits = 0
        row = bytearray(mask_row)
        for x in range(size):
            if pixel(size, x, y)[3] == 0:
                row[x // 8] |= 0x80 >> (x % 8)
        mask += bytes(row)
    header = struct.pack("<IiiHHIIiiII", 40, size, size * 2, 1, 32, 0, len(xor) + len(mask), 0, 0, 0, 0)
    return header + xor + mask


def main(out):
    sizes = (32, 16)
    images = [image(s) for s in sizes]
    data = struct.pack("<HHH", 0, 1, len(sizes))
    offset = 6 + 16 * len(sizes)
    for s, img in zip(sizes, images):
        data += struct.pack("<BBBBHHII", s, s, 0, 0, 1, 32, len(img), offset)
        offset += len(img)
    data += b"".join(images)
    with open(out, "wb") as f:
        f.write(data)


if __name__ == "__main__":
    main(sys.argv[1] if len(sys.argv) > 1 else "qomfcext/res/error.ico")
