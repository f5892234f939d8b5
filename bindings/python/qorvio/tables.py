"""Frames as tables, as `qorvio read` prints them."""

import html as _html
from typing import List, Optional, Sequence, Tuple

Row = Tuple[str, str, bool, bool, Optional[bool], Optional[bool]]
_HEAD = ("NAME", "VALUE", "ACTIVITY", "SYNC")


def _arrow(rose: bool, fell: bool) -> str:
    return ("↕" if fell else "↑") if rose else ("↓" if fell else "·")


def _cells(rows: Sequence[Row]) -> List[Tuple[str, ...]]:
    return [
        (name, value, _arrow(rose, fell), "" if sync_rose is None else _arrow(sync_rose, bool(sync_fell)))
        for name, value, rose, fell, sync_rose, sync_fell in rows
    ]


def text(rows: Sequence[Row]) -> str:
    """A line an input, in columns."""
    lines = [_HEAD, *_cells(rows)]
    widths = [max(len(line[column]) for line in lines) for column in range(len(_HEAD))]
    return "\n".join("  ".join(cell.ljust(width) for cell, width in zip(line, widths)).rstrip() for line in lines)


def html(rows: Sequence[Row]) -> str:
    """A row an input."""
    head = "".join(f"<th>{cell}</th>" for cell in _HEAD)
    body = "".join(
        "<tr>" + "".join(f"<td>{_html.escape(cell)}</td>" for cell in line) + "</tr>" for line in _cells(rows)
    )
    return f"<table><thead><tr>{head}</tr></thead><tbody>{body}</tbody></table>"
