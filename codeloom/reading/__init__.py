"""Finding source files and reading them: folders, encodings, versions of Python."""
