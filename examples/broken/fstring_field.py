"""Faults inside strings: fields of f-strings, and hints in quotes and comments."""


def describe(item: "dict[str, int", width=20):
    title = f"{item['name']:>{width}}: {item['count' items"
    rows = f"""
    {title}
    {'-' * len title}
    {item['price']:.2f}
    """
    return rows + f"{item['note']!r}"


def total(items):  # type: (list[dict) -> int
    return sum(item["count"] for item in items)
