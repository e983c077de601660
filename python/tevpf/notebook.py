"""Pictures of files, lists and tables in HTML, as notebooks show them."""

from __future__ import annotations

import html
from typing import TYPE_CHECKING, Any, Iterable, Optional, Sequence

if TYPE_CHECKING:
    from .definitions import Column, Parameter

SHOWN_ROWS = 10


def text_of(value: Any, precision: Optional[int] = None) -> str:
    """A value with as many significant digits as its precision says."""
    return f"{value:.{precision}g}" if precision and isinstance(value, float) else str(value)


def bounds_text(definition: "Parameter | Column") -> str:
    """The bounds that are narrower than the type's range."""
    from .definitions import RANGES

    low, high = RANGES.get(definition.type, (None, None))
    parts = []
    if definition.min not in (None, low):
        parts.append(f"from {definition.min:g}")
    if definition.max not in (None, high):
        parts.append(f"to {definition.max:g}")
    return " ".join(parts)


def table_html(title: str, heads: Iterable[str], rows: Iterable[Sequence[str]],
               right: Sequence[bool] = ()) -> str:
    """A table of texts, all of them escaped; ``right`` says which columns hold numbers."""
    style = [' style="text-align: right"' if is_right else ' style="text-align: left"'
             for is_right in right]

    def cells(tag: str, texts: Iterable[str]) -> str:
        return "".join(f"<{tag}{style[i] if i < len(style) else ''}>{html.escape(text)}</{tag}>"
                       for i, text in enumerate(texts))

    body = "".join(f"<tr>{cells('td', row)}</tr>" for row in rows)
    caption = f"<caption>{html.escape(title)}</caption>" if title else ""
    return f"<table>{caption}<thead><tr>{cells('th', heads)}</tr></thead><tbody>{body}</tbody></table>"


def parameters_html(title: str, parameters: Iterable["Parameter"]) -> str:
    rows = [(p.name, text_of(p.value, p.precision), p.units, bounds_text(p), p.description)
            for p in parameters]
    return table_html(title, ("name", "value", "units", "bounds", "description"), rows,
                      (False, True, False, False, False))


def rows_html(title: str, columns: Sequence["Column"], rows: Iterable[Sequence[Any]],
              more: int) -> str:
    """The rows shown of a table, with the number of those that are not."""
    heads = [f"{c.name} [{c.units}]" if c.units else c.name for c in columns]
    texts = [["" if value != value else text_of(value, column.precision)
              for column, value in zip(columns, row)] for row in rows]
    if more:
        texts.append([f"and {more} more"] + [""] * (len(columns) - 1))
    return table_html(title, heads, texts, [c.type != "str" for c in columns])
