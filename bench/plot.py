"""A plot as an SVG picture: lines of measured points on two logarithmic axes."""

import math
from xml.sax.saxutils import escape

WIDTH, HEIGHT = 680, 420
LEFT, RIGHT, TOP, BOTTOM = 70, 250, 20, 50
COLOURS = ("#1b6ca8", "#c0392b", "#1e8449", "#7d3c98", "#b9770e", "#34495e", "#a04070", "#117a65",
           "#5d4037")


class Axis:
    """Values on a logarithmic scale between two positions of the picture."""

    def __init__(self, values, begin, end):
        self.low = math.floor(math.log10(min(values)))
        self.high = max(self.low + 1, math.ceil(math.log10(max(values))))
        self.begin, self.end = begin, end

    def position(self, value):
        share = (math.log10(value) - self.low) / (self.high - self.low)
        return round(self.begin + share * (self.end - self.begin), 1)

    def powers(self):
        return [10.0 ** power for power in range(self.low, self.high + 1)]


def text(x, y, content, anchor="start", more=""):
    return f'<text x="{x}" y="{y}" text-anchor="{anchor}" {more}>{escape(content)}</text>'


def line(x1, y1, x2, y2):
    return f'<path d="M{x1} {y1}L{x2} {y2}" stroke="#cccccc"/>'


def number(value):
    for factor, suffix in ((1e6, " M"), (1e3, " k")):
        if value >= factor:
            return f"{value / factor:g}{suffix}"
    return f"{value:g}"


def axes(across, up, labels):
    bottom, right = HEIGHT - BOTTOM, WIDTH - RIGHT
    for value in across.powers():
        x = across.position(value)
        yield line(x, TOP, x, bottom)
        yield text(x, bottom + 18, number(value), "middle")
    for value in up.powers():
        y = up.position(value)
        yield line(LEFT, y, right, y)
        yield text(LEFT - 8, y + 4, number(value), "end")
    yield text((LEFT + right) / 2, HEIGHT - 10, labels[0], "middle")
    middle = (TOP + bottom) / 2
    yield text(16, middle, labels[1], "middle", f'transform="rotate(-90 16 {middle})"')


def polyline(places, index):
    """With the colours used up, the same colours again in dashes."""
    dashes = ' stroke-dasharray="5 3"' if index >= len(COLOURS) else ""
    return (f'<polyline fill="none" stroke="{COLOURS[index % len(COLOURS)]}" stroke-width="2"{dashes} '
            'points="' + " ".join(f"{x},{y}" for x, y in places) + '"/>')


def series(across, up, points, index):
    places = [(across.position(x), up.position(y)) for x, y in points]
    yield polyline(places, index)
    for x, y in places:
        yield f'<circle cx="{x}" cy="{y}" r="3" fill="{COLOURS[index % len(COLOURS)]}"/>'


def entry(name, index):
    """A line's part of the legend."""
    x, y = WIDTH - RIGHT + 12, TOP + 16 + 20 * index
    yield polyline([(x, y - 4), (x + 26, y - 4)], index)
    yield text(x + 34, y, name)


def svg(lines, labels):
    """`lines`: {name: [(x, y), ...]}. `labels`: what stands at the two axes."""
    points = [point for some in lines.values() for point in some]
    across = Axis([x for x, _ in points], LEFT, WIDTH - RIGHT)
    up = Axis([y for _, y in points], HEIGHT - BOTTOM, TOP)
    parts = [f'<svg xmlns="http://www.w3.org/2000/svg" viewBox="0 0 {WIDTH} {HEIGHT}" '
             'font-family="sans-serif" font-size="12">',
             f'<rect width="{WIDTH}" height="{HEIGHT}" fill="white"/>', *axes(across, up, labels)]
    for index, (name, some) in enumerate(lines.items()):
        parts += [*series(across, up, some, index), *entry(name, index)]
    return "\n".join([*parts, "</svg>", ""])
