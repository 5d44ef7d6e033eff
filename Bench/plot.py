"""A plot of time against size with logarithmic axes, as an SVG written by hand."""

import math

WIDTH, HEIGHT = 720, 440
LEFT, RIGHT, TOP, BOTTOM = 70, 210, 20, 50  # margins; the names of the curves stand in the right one
COLOURS = ["#1b6ca8", "#7fb3d5", "#b03a2e", "#e6a59e", "#3d8c40", "#8e5ea2"]


class LogAxis:
    """Maps values to pixels between `first` and `last`; its ticks are powers of ten."""

    def __init__(self, values, first, last):
        self.low = math.floor(math.log10(min(values)))
        self.high = max(math.ceil(math.log10(max(values))), self.low + 1)
        self.first, self.last = first, last

    def at(self, value):
        share = (math.log10(value) - self.low) / (self.high - self.low)
        return self.first + share * (self.last - self.first)

    def ticks(self):
        return [10.0 ** power for power in range(self.low, self.high + 1)]


def size_label(size):
    return "%g MB" % size if size >= 1 else "%g KB" % (size * 1000)


def time_label(seconds):
    return "%g s" % seconds if seconds >= 1 else "%g ms" % (seconds * 1000)


def text(x, y, content, anchor="middle", extra=""):
    return '<text x="%.1f" y="%.1f" text-anchor="%s"%s>%s</text>' % (x, y, anchor, extra, content)


def grid(x_axis, y_axis):
    lines = []
    bottom, right = HEIGHT - BOTTOM, WIDTH - RIGHT
    for size in x_axis.ticks():
        x = x_axis.at(size)
        lines.append('<path d="M%.1f %dV%d" stroke="#ddd"/>' % (x, TOP, bottom))
        lines.append(text(x, bottom + 18, size_label(size)))
    for seconds in y_axis.ticks():
        y = y_axis.at(seconds)
        lines.append('<path d="M%d %.1fH%d" stroke="#ddd"/>' % (LEFT, y, right))
        lines.append(text(LEFT - 8, y + 4, time_label(seconds), "end"))
    return lines


def curve(points, x_axis, y_axis, colour):
    pixels = [(x_axis.at(size), y_axis.at(seconds)) for size, seconds in points]
    path = " ".join("%.1f,%.1f" % pixel for pixel in pixels)
    dots = ['<circle cx="%.1f" cy="%.1f" r="3" fill="%s"/>' % (*pixel, colour) for pixel in pixels]
    return ['<polyline points="%s" fill="none" stroke="%s" stroke-width="2"/>' % (path, colour), *dots]


def legend(names):
    lines = []
    for at, name in enumerate(names):
        y = TOP + 14 + 20 * at
        x = WIDTH - RIGHT + 12
        colour = COLOURS[at % len(COLOURS)]
        lines.append('<path d="M%d %dh18" stroke="%s" stroke-width="3"/>' % (x, y - 4, colour))
        lines.append(text(x + 24, y, name, "start"))
    return lines


def write_log_plot(path, curves, x_title, y_title):
    """Draws the curves: a name for each and its points, (bytes, seconds). Without a point nothing is written."""
    curves = {name: sorted((size / 2 ** 20, seconds) for size, seconds in points) for name, points in curves.items()}
    points = [point for some in curves.values() for point in some]
    if not points:
        return
    x_axis = LogAxis([size for size, _ in points], LEFT, WIDTH - RIGHT)
    y_axis = LogAxis([seconds for _, seconds in points], HEIGHT - BOTTOM, TOP)
    lines = grid(x_axis, y_axis)
    for at, some in enumerate(curves.values()):
        lines += curve(some, x_axis, y_axis, COLOURS[at % len(COLOURS)])
    lines += legend(curves)
    lines.append(text((LEFT + WIDTH - RIGHT) / 2, HEIGHT - 10, x_title))
    lines.append(text(16, HEIGHT / 2, y_title, "middle", ' transform="rotate(-90 16 %d)"' % (HEIGHT / 2)))
    with open(path, "w", encoding="ascii") as out:
        out.write('<svg xmlns="http://www.w3.org/2000/svg" viewBox="0 0 %d %d" font-family="sans-serif" '
                  'font-size="12" fill="#222">\n<rect width="100%%" height="100%%" fill="white"/>\n' % (WIDTH, HEIGHT))
        out.write("\n".join(lines) + "\n</svg>\n")
