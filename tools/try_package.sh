#!/bin/sh
# Makes an sdist and from it a wheel, checks both, and tries the wheel in a fresh environment without a compiler.
#     sh tools/try_package.sh FOLDER-OF-TOOLS FOLDER-FOR-RESULTS
set -eu
tools=$1
mkdir -p "$2"
out=$(cd "$2" && pwd)
rm -rf "$out/dist" "$out/fresh"

"$tools/validate-pyproject" pyproject.toml
"$tools/cibuildwheel" --platform linux --print-build-identifiers > "$out/wheels-of-ci"
test "$(grep -c 'cp31[123]-manylinux' "$out/wheels-of-ci")" -ge 3

"$tools/python" -m build --outdir "$out/dist" .
"$tools/twine" check --strict "$out/dist"/*
"$tools/check-wheel-contents" "$out/dist"/*.whl
# The wheel is for one version of the interpreter: there is nothing to audit unless that changes.
case $(echo "$out/dist"/*.whl) in *-abi3-*) "$tools/abi3audit" --strict "$out/dist"/*.whl ;; esac

"$tools/python" -m venv "$out/fresh"
cat > "$out/broken.py" <<'END'
print "a"
x = (
def f(): return )
END
# Nothing but the environment is on the path.
(
    cd "$out"
    PATH="$out/fresh/bin"
    export PATH
    unset PYTHONPATH
    ! command -v cc && ! command -v g++ && ! command -v cmake
    pip install --quiet dist/*.whl
    pip list
    codeloom --version
    codeloom check --exit-zero broken.py
    codeloom completion bash > completion.bash
    python -c 'import codeloom.treesift; print(codeloom.analyze("x = )").problems[0])'
)
