"""A file as it looks while somebody types: each unfinished line is found, and no other."""

import csv
from pathlib import

TOTAL = 


class Ledger:
    def __init__(self, path
        self.path = path
        self.rows = []

    def read(self):
        with open(self.path, newline="") as file:
            for row in csv.DictReader(file)
                self.rows.append(row)

    def balance(self, account):
        return sum(float(row["amount"]) for row in self.rows if row["account"] = account)

    def largest(self):
        return max(self.rows, key=lambda row: abs(row["amount"])))

    def __repr__(self):
        return f"<Ledger {self.path} of {len(self.rows)} rows>"
