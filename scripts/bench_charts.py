# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
"""Draws the groups of ./bench as bar charts, in SVG that follows the reader's light or dark mode."""

import html
import re

WIDTH = 760
LABELS = 270  # width of the names
VALUES = 80  # width of the figures at the end
ROW = 24
BAR = 14

STYLE = """
text { font: 13px system-ui, sans-serif; fill: #24292f; }
.peer { fill: #9aa7b4; } .project { fill: #2f6fdb; } .floor { fill: #d0d7de; }
.spread { stroke: #24292f; stroke-width: 1.5; }
@media (prefers-color-scheme: dark) {
text { fill: #e6edf3; }
.peer { fill: #57636f; } .project { fill: #6ea8fe; } .floor { fill: #30363d; }
.spread { stroke: #e6edf3; }
}
"""


def file_name(group):
    return re.sub(r"[^a-z0-9]+", "-", group.lower()).strip("-") + ".svg"


def kind_of(name):
    if name.startswith(("floor", "empty window", "window of labels")):
        return "floor"
    return "project" if re.match("Tork|velocor|parse manager", name) else "peer"


def chart(rows):
    """The chart of a group as text. Each row is (name, value, low, high, value as text): the bar
    goes up to the value, the line over it from low to high."""
    scale = (WIDTH - LABELS - VALUES) / max(max(high, value) for _, value, _, high, _ in rows)
    height = ROW * len(rows) + 8
    lines = [
        f'<svg xmlns="http://www.w3.org/2000/svg" viewBox="0 0 {WIDTH} {height}" '
        f'width="{WIDTH}" height="{height}" role="img">',
        f"<style>{STYLE}</style>",
    ]
    for place, (name, value, low, high, text) in enumerate(rows):
        middle = ROW * place + ROW / 2 + 4
        end = LABELS + value * scale
        left, right = LABELS + low * scale, LABELS + high * scale
        lines += [
            f'<text x="{LABELS - 8}" y="{middle + 4:.0f}" text-anchor="end">'
            f"{html.escape(name)}</text>",
            f'<rect class="{kind_of(name)}" x="{LABELS}" y="{middle - BAR / 2:.0f}" '
            f'width="{end - LABELS:.1f}" height="{BAR}" rx="2"/>',
            f'<line class="spread" x1="{left:.1f}" x2="{right:.1f}" y1="{middle:.0f}" '
            f'y2="{middle:.0f}"/>',
            f'<text x="{max(end, right) + 6:.1f}" y="{middle + 4:.0f}">{html.escape(text)}</text>',
        ]
    return "\n".join([*lines, "</svg>", ""])


def write(folder, charts, is_whole):
    """Writes charts, texts by group, into the folder; if they are all, others are removed."""
    folder.mkdir(parents=True, exist_ok=True)
    for old in folder.glob("*.svg") if is_whole else ():
        old.unlink()
    for group, text in charts.items():
        (folder / file_name(group)).write_text(text, encoding="utf-8")
