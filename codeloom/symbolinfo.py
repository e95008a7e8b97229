"""The vocabulary of symbol records."""
