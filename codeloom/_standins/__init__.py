"""Stand-ins for modules of the product that hosts the engine.

They are offered under the host's names, and only while the engine loads.
"""
