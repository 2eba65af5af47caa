"""Draws the times of the benchmarks as horizontal bars."""

from xml.sax.saxutils import escape

GROUPS = (
    ("Import", (("import/dcm", "dcm"), ("import/floor", "reading floor"),
                ("import/simdjson", "simdjson"), ("import/rapidjson", "RapidJSON"),
                ("import/naive", "getline and wcstod"))),
    ("Export", (("export/dcm", "dcm"), ("export/floor", "writing floor"),
                ("export/rapidjson", "RapidJSON's writer"), ("export/snprintf", "snprintf"))),
    ("Number text", (("text/dcm", "dcm"), ("text/to_chars", "std::to_chars"),
                     ("text/fmt", "fmt"))),
)
PANELS = (("full", "17 digits"), ("short", "few digits"))
OURS, OTHERS = "#1f6fb2", "#b8bec6"
PANEL, LABEL, LINE, BAR = 440, 150, 22, 15


def draw(medians):
    """The chart as SVG; `medians` maps each flavour to its figures, in nanoseconds a number."""
    shapes = []
    height = 0
    for index, (flavour, title) in enumerate(PANELS):
        left = 20 + index * PANEL
        y = 30
        shapes.append(text(left, y, f"{title}, ns a number", "bold"))
        figures = medians[flavour]
        shown = [figures[name] for _, bars in GROUPS for name, _ in bars if name in figures]
        scale = (PANEL - LABEL - 70) / max(shown)
        for group, bars in GROUPS:
            y += LINE + 8
            shapes.append(text(left, y, group, "bold"))
            for name, label in bars:
                if name not in figures:
                    continue
                y += LINE
                width = figures[name] * scale
                shapes.append(text(left, y, label))
                shapes.append(f'<rect x="{left + LABEL}" y="{y - 12}" width="{width:.1f}" '
                              f'height="{BAR}" fill="{OURS if label == "dcm" else OTHERS}"/>')
                shapes.append(text(left + LABEL + width + 6, y, f"{figures[name]:.0f}"))
        height = max(height, y + 20)
    width = 20 + len(PANELS) * PANEL
    return "\n".join([
        f'<svg xmlns="http://www.w3.org/2000/svg" width="{width}" height="{height}" '
        f'viewBox="0 0 {width} {height}" font-family="sans-serif" font-size="13" fill="#24292f">',
        '<rect width="100%" height="100%" fill="#ffffff"/>', *shapes, "</svg>", ""])


def text(x, y, content, weight="normal"):
    return f'<text x="{x:.1f}" y="{y}" font-weight="{weight}">{escape(content)}</text>'
