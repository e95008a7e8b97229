# make run     set up what is missing, build, and check the examples and the interpreter's own library
# make test    set up what is missing, build, and run all tests
# The rest: docs, package, lint, tidy, format, asan, leaks, fuzz, edits, bench, bench-short, clean.

# Another host has an environment of its own: make test PYTHON=python3.13
PYTHON ?= python3.11
VENV   := .venv$(if $(filter-out python3.11,$(notdir $(PYTHON))),-$(notdir $(PYTHON)))
BIN    := $(VENV)/bin
STAMP  := $(VENV)/.installed

SOURCES   := $(shell find src resources codeloom -type f -not -name '*.pyc') CMakeLists.txt pyproject.toml README.md
CXX_FILES := $(shell find src tests -name '*.h' -o -name '*.cpp')
STDLIB     = $(shell $(BIN)/python -c "import sysconfig; print(sysconfig.get_path('stdlib'))")

.PHONY: run test engines docs package lint tidy format asan asan-short leaks fuzz edits bench bench-short build clean

build: $(STAMP)

$(BIN)/python:
	$(PYTHON) -m venv $(VENV)
	$(BIN)/pip install --quiet --upgrade pip

$(VENV)/.tools: pyproject.toml | $(BIN)/python
	$(BIN)/pip install --quiet --group build
	touch $@

$(STAMP): $(SOURCES) $(VENV)/.tools
	$(BIN)/pip install --quiet --no-build-isolation . --group test --group lint
	touch $@

run: build
	@$(BIN)/codeloom check --python 3.14 examples || true
	@$(BIN)/codeloom check $(STDLIB) | tail -n 1

test: build
	$(BIN)/pytest

# The site, in build/site; a warning is an error.
docs: $(VENV)/.tools
	$(BIN)/pip install --quiet --group docs
	$(BIN)/mkdocs build --quiet --strict

# An sdist, a wheel made from it, and all that checks them; then the wheel in a fresh environment without a compiler.
package: $(VENV)/.tools
	$(BIN)/pip install --quiet --group package
	sh tools/try_package.sh $(abspath $(BIN)) build/package

lint: build
	$(BIN)/clang-format --dry-run --Werror $(CXX_FILES)
	$(BIN)/ruff format --check codeloom tests benchmarks tools
	$(BIN)/ruff check codeloom tests benchmarks tools
	$(BIN)/mypy

# Slow, and needs a clang-tidy on the PATH.
tidy: build
	clang-tidy --quiet -p build $(filter %.cpp,$(CXX_FILES))

format: build
	$(BIN)/clang-format -i $(CXX_FILES)
	$(BIN)/ruff format codeloom tests benchmarks tools
	$(BIN)/ruff check --fix codeloom tests benchmarks tools

# Address and undefined-behaviour sanitizers over the tests, in a build of their own.
ASAN := build/asan
ASAN_RUN = LD_PRELOAD="$$(g++ -print-file-name=libasan.so) $$(g++ -print-file-name=libubsan.so)" \
	ASAN_OPTIONS=detect_leaks=0 PYTHONMALLOC=malloc PYTHONPATH=$(ASAN)/site $(BIN)/python -P

$(ASAN)/.built: $(SOURCES) $(STAMP)
	$(BIN)/cmake -S . -B $(ASAN) -G Ninja -DCODELOOM_SANITIZE=ON -DCMAKE_BUILD_TYPE=Debug \
		-DCMAKE_MAKE_PROGRAM=$(abspath $(BIN)/ninja) -DPython_EXECUTABLE=$(abspath $(BIN)/python)
	$(BIN)/cmake --build $(ASAN)
	rm -rf $(ASAN)/site && mkdir -p $(ASAN)/site
	cp -R codeloom $(ASAN)/site/
	$(BIN)/cmake --install $(ASAN) --prefix $(ASAN)/site > /dev/null
	touch $@

asan: $(ASAN)/.built
	$(ASAN_RUN) -m pytest -q

asan-short: $(ASAN)/.built
	$(ASAN_RUN) -m pytest -q -m 'not slow'

# Engines for many machines, which are too large to be installed for all tests. Spark needs Java.
engines: build
	$(BIN)/pip install --quiet "ray[data]>=2.60" "pyspark>=4" "dask[dataframe]>=2025.1"
	$(BIN)/pytest tests/ray_index.py tests/engine_recipes.py

leaks: build
	$(BIN)/python tests/leaks.py

fuzz: build
	$(BIN)/python tests/fuzz.py --seconds $(or $(SECONDS),60) $(SEED:%=--seed %)

# A document against the analysis of its text, after each of so many edits.
edits: build
	$(BIN)/python tests/document_edits.py --edits $(or $(EDITS),100000) $(SEED:%=--seed %)

bench: build
	$(BIN)/pip install --quiet --group benchmark
	$(BIN)/python benchmarks/bench.py --write

bench-short: build
	$(BIN)/python benchmarks/bench.py --short

clean:
	rm -rf build $(VENV)
