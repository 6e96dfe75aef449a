#!/usr/bin/env python3
"""Draws the pictures of the standard controls into data/textures, as 32-bit TGA files.

    button*.tga      16 by 16 nine-patch bodies (4-pixel borders) for buttons, by state
    checker*.tga     16 by 16 check boxes: on, off, both disabled, and the highlight picture
    radio*.tga       16 by 16 radio buttons, the same five pictures round
    arrow_*.tga      16 by 16 step buttons of scroll bars: up, down, left, right, by state
    scroller*.tga    16 by 16 nine-patch scroll bar thumbs, by state

Every picture is drawn here from shapes, with 4 by 4 samples a pixel for smooth edges, so the
files can be made again at any time:  python3 scripts/make_control_textures.py
"""
import math
import os
import struct

SIZE = 16
SAMPLES = 4
OUT = os.path.join(os.path.dirname(os.path.abspath(__file__)), "..", "data", "textures")


def write_tga(name, pixels):
    """pixels: rows from the top, each a list of (r, g, b, a)."""
    header = struct.pack("<BBBHHBHHHHBB", 0, 0, 2, 0, 0, 0, 0, 0, SIZE, SIZE, 32, 0x28)
    body = bytearray()
    for row in pixels:
        for r, g, b, a in row:
            body += bytes((b, g, r, a))
    with open(os.path.join(OUT, name), "wb") as out:
        out.write(header + body)


def coverage(inside, x, y):
    """Share of the pixel (x, y) for which inside(px, py) holds."""
    hits = 0
    for sy in range(SAMPLES):
        for sx in range(SAMPLES):
            if inside(x + (sx + 0.5) / SAMPLES, y + (sy + 0.5) / SAMPLES):
                hits += 1
    return hits / (SAMPLES * SAMPLES)


def over(dst, colour, alpha):
    """colour with alpha laid over dst, straight alpha."""
    r, g, b, a = dst
    a0 = a / 255.0
    a1 = alpha * colour[3] / 255.0
    out_a = a1 + a0 * (1 - a1)
    if out_a <= 0:
        return (0, 0, 0, 0)
    mix = lambda c0, c1: int(round((c1 * a1 + c0 * a0 * (1 - a1)) / out_a))
    return (mix(r, colour[0]), mix(g, colour[1]), mix(b, colour[2]), int(round(out_a * 255)))


class Picture:
    def __init__(self):
        self.pixels = [[(0, 0, 0, 0)] * SIZE for _ in range(SIZE)]

    def fill(self, inside, colour):
        for y in range(SIZE):
            for x in range(SIZE):
                c = coverage(inside, x, y)
                if c > 0:
                    self.pixels[y][x] = over(self.pixels[y][x], colour, c)
        return self

    def shade(self, inside, top, bottom):
        """A vertical gradient from top to bottom inside the shape."""
        for y in range(SIZE):
            t = y / (SIZE - 1)
            colour = tuple(int(round(top[i] + (bottom[i] - top[i]) * t)) for i in range(4))
            for x in range(SIZE):
                c = coverage(inside, x, y)
                if c > 0:
                    self.pixels[y][x] = over(self.pixels[y][x], colour, c)
        return self

    def save(self, name):
        write_tga(name, self.pixels)


# Shapes, as tests of a point in pixel units.
def rounded(x0, y0, x1, y1, radius):
    def inside(px, py):
        cx = min(max(px, x0 + radius), x1 - radius)
        cy = min(max(py, y0 + radius), y1 - radius)
        return (px - cx) ** 2 + (py - cy) ** 2 <= radius * radius and x0 <= px <= x1 and y0 <= py <= y1
    return inside


def ring(outer, inner):
    return lambda px, py: outer(px, py) and not inner(px, py)


def circle(cx, cy, radius):
    return lambda px, py: (px - cx) ** 2 + (py - cy) ** 2 <= radius * radius


def thick_line(points, width):
    """A polyline of the given width."""
    def inside(px, py):
        for (ax, ay), (bx, by) in zip(points, points[1:]):
            dx, dy = bx - ax, by - ay
            t = max(0.0, min(1.0, ((px - ax) * dx + (py - ay) * dy) / (dx * dx + dy * dy)))
            if (px - ax - t * dx) ** 2 + (py - ay - t * dy) ** 2 <= (width / 2) ** 2:
                return True
        return False
    return inside


def triangle(a, b, c):
    def side(p, q, r):
        return (q[0] - p[0]) * (r[1] - p[1]) - (q[1] - p[1]) * (r[0] - p[0])
    def inside(px, py):
        p = (px, py)
        s1, s2, s3 = side(a, b, p), side(b, c, p), side(c, a, p)
        return (s1 >= 0 and s2 >= 0 and s3 >= 0) or (s1 <= 0 and s2 <= 0 and s3 <= 0)
    return inside


# The palette: blue-grey bodies, a light edge, a warm accent for what is checked.
STATES = {
    "":             {"edge": (120, 142, 186, 255), "top": (72, 90, 128, 255), "bottom": (50, 64, 94, 255)},
    "_highlighted": {"edge": (170, 196, 240, 255), "top": (92, 116, 162, 255), "bottom": (66, 86, 126, 255)},
    "_pushed":      {"edge": (100, 120, 160, 255), "top": (38, 48, 72, 255), "bottom": (54, 68, 98, 255)},
    "_disabled":    {"edge": (86, 88, 94, 255), "top": (62, 64, 70, 255), "bottom": (52, 54, 58, 255)},
    "_checked":     {"edge": (236, 186, 84, 255), "top": (44, 56, 84, 255), "bottom": (60, 76, 108, 255)},
}

BODY = rounded(0, 0, 16, 16, 3.5)
INNER = rounded(1, 1, 15, 15, 2.5)


# The centre of a nine-patch repeats, so the body is flat with a lighter top rim and a darker
# bottom rim inside its edge: the bevel stays in the corners and edges.
def body(state):
    s = STATES[state]
    middle = tuple((a + b) // 2 for a, b in zip(s["top"], s["bottom"]))
    picture = Picture().fill(BODY, s["edge"]).fill(INNER, middle)
    picture.fill(lambda px, py: 1 <= py <= 3 and INNER(px, py), s["top"])
    return picture.fill(lambda px, py: 13 <= py <= 15 and INNER(px, py), s["bottom"])


def buttons():
    for state in STATES:
        body(state).save("button%s.tga" % state)


def scrollers():
    for state in ("", "_highlighted", "_pushed"):
        s = STATES[state]
        grip = (s["edge"][0], s["edge"][1], s["edge"][2], 200)
        middle = tuple((a + b) // 2 for a, b in zip(s["top"], s["bottom"]))
        picture = Picture().fill(rounded(2, 0, 14, 16, 4), s["edge"]).fill(rounded(3, 1, 13, 15, 3), middle)
        picture.fill(lambda px, py: 5 <= px <= 11 and (6.5 <= py <= 7.5 or 8.5 <= py <= 9.5), grip)
        picture.save("scroller%s.tga" % state)


ARROWS = {
    "up":    ((8, 4.5), (12.5, 10.5), (3.5, 10.5)),
    "down":  ((8, 11.5), (3.5, 5.5), (12.5, 5.5)),
    "left":  ((4.5, 8), (10.5, 3.5), (10.5, 12.5)),
    "right": ((11.5, 8), (5.5, 12.5), (5.5, 3.5)),
}


def arrows():
    for direction, corners in ARROWS.items():
        for state in ("", "_highlighted", "_pushed"):
            glyph = (236, 240, 248, 255) if state != "_pushed" else (200, 206, 220, 255)
            body(state).fill(triangle(*corners), glyph).save("arrow_%s%s.tga" % (direction, state))


TICK = thick_line([(3.8, 8.4), (6.6, 11.2), (12.2, 4.6)], 2.2)


def checkers(kind, outer, inner, mark):
    """The five pictures of a check box or a radio button."""
    looks = {
        "_on": ((150, 176, 222, 255), (26, 32, 46, 255), (128, 226, 150, 255)),
        "_off": ((150, 176, 222, 255), (26, 32, 46, 255), None),
        "_on_disabled": ((92, 94, 100, 255), (44, 46, 50, 255), (120, 124, 128, 255)),
        "_off_disabled": ((92, 94, 100, 255), (44, 46, 50, 255), None),
        "_highlighted": ((214, 230, 255, 255), (46, 58, 84, 255), (214, 230, 255, 90)),
    }
    for suffix, (edge, fill, mark_colour) in looks.items():
        picture = Picture().fill(outer, edge).fill(inner, fill)
        if mark_colour:
            picture.fill(mark, mark_colour)
        picture.save("%s%s.tga" % (kind, suffix))


def main():
    os.makedirs(OUT, exist_ok=True)
    buttons()
    scrollers()
    arrows()
    checkers("checker", rounded(1, 1, 15, 15, 2.5), rounded(2.5, 2.5, 13.5, 13.5, 1.5), TICK)
    checkers("radio", circle(8, 8, 7), circle(8, 8, 5.6), circle(8, 8, 3.2))


if __name__ == "__main__":
    main()
