# Python 3.10: match, `with` in parentheses, unions of types.
from dataclasses import dataclass


@dataclass
class Point:
    x: float
    y: float


@dataclass
class Polygon:
    corners: list[Point]


def area(shape: Point | Polygon | dict[str, float]) -> float:
    match shape:
        case Point():
            return 0.0
        case Polygon(corners=[] | [_] | [_, _]):
            return 0.0
        case Polygon(corners=[first, *_, last] as corners) if first != last:
            return shoelace(corners)
        case {"radius": (int() | float()) as radius, **rest} if not rest:
            return 3.14159 * radius**2
        case _:
            raise TypeError(f"no shape: {shape!r}")


def shoelace(corners: list[Point]) -> float:
    pairs = zip(corners, corners[1:] + corners[:1])
    return abs(sum(a.x * b.y - b.x * a.y for a, b in pairs)) / 2


def copy_shapes(source: str, target: str) -> None:
    with (
        open(source, encoding="utf-8") as reader,
        open(target, "w", encoding="utf-8") as writer,
    ):
        writer.writelines(reader)
