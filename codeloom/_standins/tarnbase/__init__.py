"""Base classes of the host product."""
