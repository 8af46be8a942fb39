# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""The plot of time against N as an SVG picture: both axes logarithmic, a line a series with its name at its end."""
import math

WIDTH, HEIGHT = 860, 520
LEFT, RIGHT, TOP, BOTTOM = 78, 190, 54, 62
# Told apart by those who see few colours too; the second of each is for a dark ground.
COLOURS = [("#b5442a", "#f08a6c"), ("#1f6fb4", "#6db3f2"), ("#2f7d3b", "#7ccf88"), ("#8a4fb0", "#c89be8"),
           ("#9a6a00", "#e3b341"), ("#0f7f86", "#5fd0d6"), ("#5b6472", "#a9b4c4")]
LABEL_HEIGHT = 18
UNITS = ((1e6, "s"), (1e3, "ms"), (1.0, "µs"), (1e-3, "ns"))


def escaped(text):
    return text.replace("&", "&amp;").replace("<", "&lt;").replace(">", "&gt;")


def time_name(microseconds):
    for size, unit in UNITS:
        if microseconds >= size * 0.999:
            break
    return f"{microseconds / size:.3g} {unit}"


class Axis:
    """Maps numbers to a range of pixels by their logarithm."""

    def __init__(self, numbers, first, last):
        self.low, self.high = math.log10(min(numbers)), math.log10(max(numbers))
        self.first, self.last = first, last

    def at(self, number):
        return self.first + (math.log10(number) - self.low) / (self.high - self.low) * (self.last - self.first)


def decades(numbers):
    """The powers of ten around all numbers."""
    return [10.0 ** power for power in range(math.floor(math.log10(min(numbers))),
                                             math.ceil(math.log10(max(numbers))) + 1)]


def style():
    def rules(dark):
        ground, ink, faint, grid = (("#16181d", "#e8eaee", "#a7adb8", "#333842") if dark else
                                    ("#ffffff", "#1d2127", "#59616e", "#e3e6ea"))
        lines = [f".ground {{ fill: {ground} }}", f".ink {{ fill: {ink} }}", f".faint {{ fill: {faint} }}",
                 f".grid {{ stroke: {grid} }}", f".axis {{ stroke: {faint} }}", f".dot {{ stroke: {ground} }}"]
        for i, colours in enumerate(COLOURS):
            lines.append(f".line{i} {{ stroke: {colours[dark]} }} .fill{i} {{ fill: {colours[dark]} }}")
        return "\n    ".join(lines)

    return f"""  <style>
    text {{ font-family: system-ui, -apple-system, "Segoe UI", "DejaVu Sans", sans-serif; font-size: 13px }}
    .title {{ font-size: 16px; font-weight: 600 }}
    polyline {{ fill: none; stroke-width: 2; stroke-linejoin: round }}
    .dot {{ stroke-width: 1.5 }}
    .leader {{ fill: none; stroke-width: 1; opacity: 0.55 }}
    {rules(0)}
    @media (prefers-color-scheme: dark) {{
    {rules(1)}
    }}
  </style>
"""


def grid(x_axis, y_axis, x_ticks, y_ticks):
    right, bottom = WIDTH - RIGHT, HEIGHT - BOTTOM
    parts = []
    for number in y_ticks:
        y = y_axis.at(number)
        parts.append(f'  <line class="grid" x1="{LEFT}" y1="{y:.1f}" x2="{right}" y2="{y:.1f}"/>\n'
                     f'  <text class="faint" x="{LEFT - 8}" y="{y + 4:.1f}" text-anchor="end">{time_name(number)}</text>\n')
    for number in x_ticks:
        x = x_axis.at(number)
        parts.append(f'  <line class="grid" x1="{x:.1f}" y1="{TOP}" x2="{x:.1f}" y2="{bottom}"/>\n'
                     f'  <text class="faint" x="{x:.1f}" y="{bottom + 20}" text-anchor="middle">{number:,.0f}</text>\n')
    parts.append(f'  <line class="axis" x1="{LEFT}" y1="{bottom}" x2="{right}" y2="{bottom}"/>\n')
    parts.append(f'  <text class="ink" x="{(LEFT + right) / 2:.0f}" y="{HEIGHT - 16}" text-anchor="middle">'
                 f'N: siblings, subkeys or values of one key</text>\n')
    parts.append(f'  <text class="ink" transform="translate(20 {(TOP + bottom) / 2:.0f}) rotate(-90)" '
                 f'text-anchor="middle">time for one</text>\n')
    return "".join(parts)


def spread(wanted):
    """Places for labels, near those wanted, none closer to the next than a label's height."""
    order = sorted(range(len(wanted)), key=lambda i: wanted[i])
    groups = []  # [sum of wanted places less their offsets, members]
    for i in order:
        groups.append([wanted[i], [i]])
        while len(groups) > 1 and top_of(groups[-2]) + len(groups[-2][1]) * LABEL_HEIGHT > top_of(groups[-1]):
            total, members = groups.pop()
            groups[-1][0] += total - len(members) * len(groups[-1][1]) * LABEL_HEIGHT
            groups[-1][1] += members
    places = [0.0] * len(wanted)
    for group in groups:
        for k, i in enumerate(group[1]):
            places[i] = top_of(group) + k * LABEL_HEIGHT
    return places


def top_of(group):
    return group[0] / len(group[1])


def one_series(i, name, points, label_y):
    colour = i % len(COLOURS)
    x, y, _, _ = points[-1]
    label_x = WIDTH - RIGHT + 22
    dots = "".join(f'    <circle class="dot fill{colour}" cx="{px:.1f}" cy="{py:.1f}" r="4">'
                   f'<title>{escaped(name)}, N = {n:,}: {time_name(time)}</title></circle>\n'
                   for px, py, n, time in points)
    line = " ".join(f"{px:.1f},{py:.1f}" for px, py, _, _ in points)
    return (f'  <g class="series">\n    <title>{escaped(name)}</title>\n'
            f'    <polyline class="leader line{colour}" points="{x + 6:.1f},{y:.1f} {label_x - 5},{label_y:.1f}"/>\n'
            f'    <polyline class="line{colour}" points="{line}"/>\n{dots}'
            f'    <circle class="fill{colour}" cx="{label_x}" cy="{label_y:.1f}" r="4"/>\n'
            f'    <text class="ink" x="{label_x + 10}" y="{label_y + 4.5:.1f}">{escaped(name)}</text>\n  </g>\n')


def drawing(series):
    """series: (name, [(N, microseconds)]) each."""
    numbers = [n for _, points in series for n, _ in points]
    times = [time for _, points in series for _, time in points]
    x_ticks = [n for n in (tick * step for tick in decades(numbers) for step in (1, 2, 5))
               if min(numbers) <= n <= max(numbers)]
    y_ticks = decades(times)
    x_axis = Axis([min(numbers) / 1.1, max(numbers) * 1.1], LEFT, WIDTH - RIGHT)
    y_axis = Axis(y_ticks, HEIGHT - BOTTOM, TOP)
    placed = [[(x_axis.at(n), y_axis.at(time), n, time) for n, time in points] for _, points in series]
    labels = spread([points[-1][1] for points in placed])
    body = "".join(one_series(i, name, placed[i], labels[i]) for i, (name, _) in enumerate(series))
    return (f'<svg xmlns="http://www.w3.org/2000/svg" width="{WIDTH}" height="{HEIGHT}" '
            f'viewBox="0 0 {WIDTH} {HEIGHT}" role="img">\n'
            f'  <title>Time for one against N</title>\n{style()}'
            f'  <rect class="ground" width="{WIDTH}" height="{HEIGHT}"/>\n'
            f'  <text class="ink title" x="{LEFT}" y="30">Time for one key, path or value against N</text>\n'
            f'{grid(x_axis, y_axis, x_ticks, y_ticks)}{body}</svg>\n')
