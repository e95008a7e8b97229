"""Utilities of the host product."""
