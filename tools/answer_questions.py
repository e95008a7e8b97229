"""Ask the questions of docs/questions.md again, and write the answers beneath them.

python tools/answer_questions.py INDEX
"""

import pathlib
import re
import subprocess
import sys

PAGE = pathlib.Path(__file__).parent.parent / "docs/questions.md"
QUESTION = re.compile(r"```sql\n(?P<sql>.*?)```\n```text\n.*?```", re.DOTALL)


def questions() -> list[str]:
    """The SQL of each question, in its order."""
    return [match["sql"] for match in QUESTION.finditer(PAGE.read_text(encoding="utf-8"))]


def with_answers(page: str, index: str) -> str:
    """The page with the answers about an index."""

    def answered(match: re.Match[str]) -> str:
        sql = match["sql"]
        command = [sys.executable, "-P", "-m", "codeloom", "query", sql, index]
        answer = subprocess.run(command, capture_output=True, check=True, encoding="utf-8").stdout
        return f"```sql\n{sql}```\n```text\n{answer}```"

    return QUESTION.sub(answered, page)


if __name__ == "__main__":
    PAGE.write_text(with_answers(PAGE.read_text(encoding="utf-8"), sys.argv[1]), encoding="utf-8")
