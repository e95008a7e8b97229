"""Text primitives."""
