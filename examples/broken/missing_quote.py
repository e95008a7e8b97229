"""A quote is missing, and the string ends with its row."""

GREETING = 'good morning
FAREWELL = "good night"


def greet(name, late=False):
    return (FAREWELL if late else GREETING) + ", " + name
