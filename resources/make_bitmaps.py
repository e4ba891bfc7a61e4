#!/usr/bin/env python3
"""Draws the two object pictures of the module as 32x32, 16-colour, uncompressed
Windows bitmaps: quorrel400.bmp (a 3x3 grid of cells) and quorrel401.bmp (a small
table with a header row). Run from this folder; the output is committed."""

import struct

# The standard 16-colour palette, as (red, green, blue).
PALETTE = [
    (0, 0, 0), (128, 0, 0), (0, 128, 0), (128, 128, 0),
    (0, 0, 128), (128, 0, 128), (0, 128, 128), (192, 192, 192),
    (128, 128, 128), (255, 0, 0), (0, 255, 0), (255, 255, 0),
    (0, 0, 255), (255, 0, 255), (0, 255, 255), (255, 255, 255),
]
BLACK, NAVY, GREY, WHITE, YELLOW, CYAN, RED = 0, 4, 8, 15, 11, 14, 9
SIZE = 32


def blank(colour):
    return [[colour] * SIZE for _ in range(SIZE)]


def fill(pixels, x0, y0, x1, y1, colour):
    for y in range(y0, y1):
        for x in range(x0, x1):
            pixels[y][x] = colour


def grid_picture():
    pixels = blank(WHITE)
    colours = [NAVY, CYAN, NAVY, CYAN, RED, CYAN, NAVY, CYAN, NAVY]
    for row in range(3):
        for col in range(3):
            x, y = 2 + col * 10, 2 + row * 10
            fill(pixels, x, y, x + 9, y + 9, BLACK)
            fill(pixels, x + 1, y + 1, x + 8, y + 8, colours[row * 3 + col])
    return pixels


def table_picture():
    pixels = blank(WHITE)
    fill(pixels, 1, 3, 31, 29, BLACK)
    fill(pixels, 2, 4, 30, 9, NAVY)
    for row in range(4):
        y = 10 + row * 5
        fill(pixels, 2, y, 30, y + 4, YELLOW if row % 2 else WHITE)
    for x in (11, 21):
        fill(pixels, x, 4, x + 1, 29, GREY)
    return pixels


def bitmap_bytes(pixels):
    # Rows are stored bottom-up; two pixels per byte, the left one in the high nibble.
    rows = b"".join(
        bytes((row[x] << 4) | row[x + 1] for x in range(0, SIZE, 2)) for row in reversed(pixels))
    palette = b"".join(struct.pack("<BBBB", b, g, r, 0) for (r, g, b) in PALETTE)
    info = struct.pack("<IiiHHIIiiII", 40, SIZE, SIZE, 1, 4, 0, len(rows), 2835, 2835, 16, 0)
    offset = 14 + len(info) + len(palette)
    header = struct.pack("<2sIHHI", b"BM", offset + len(rows), 0, 0, offset)
    return header + info + palette + rows


if __name__ == "__main__":
    for name, picture in (("quorrel400.bmp", grid_picture()), ("quorrel401.bmp", table_picture())):
        with open(name, "wb") as out:
            out.write(bitmap_bytes(picture))
