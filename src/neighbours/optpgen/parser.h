// The parser as its users know it. Everything is inline, since the engine is an extension of its own.
#pragma once

#include <nanobind/nanobind.h>

#include "host/errors.h"
#include "host/overrides.h"

namespace codeloom {

// Takes the tokens of a text one by one; ParserImpl is the one that runs on a grammar's tables.
class Parser : public CHosted {
  public:
    void Init() {}

    OPERATIONS_OF(Parser, CNoOperations)
    OPERATION(
        void, setup, (nb::handle),
        "Begin a new parse, whatever became of the last one.\n\n"
        "`start` (int) is the number of the rule to parse; None stands for the grammar's start symbol.\n"
        "Raises ValueError when no rule has that number.",
        "start"_a = nb::none()) { _RaiseNotImplemented(); }
    OPERATION(
        bool, addtoken, (int, nb::handle, nb::handle),
        "Feed one token; True when the start symbol is complete.\n\n"
        "`type` (int) is the token type, `value` (str or None) the token's text and `context` any object:\n"
        "it goes into the nodes, and into the ParseError that is raised on a token which the grammar\n"
        "refuses. Raises RuntimeError when no parse is going on.",
        "type"_a, "value"_a.none(), "context"_a.none()) { _RaiseNotImplemented(); }
    OPERATION(
        nb::object, finish, (),
        "The root of the parse, which is handed over: the parser keeps nothing of it.\n\n"
        "Raises ParseError when the start symbol isn't complete, RuntimeError when no parse is going on.") { _RaiseNotImplemented(); }
    END_OPERATIONS

  private:
    [[noreturn]] static void _RaiseNotImplemented() {
        RaiseHost(PyExc_NotImplementedError, "a Parser needs the operations setup, addtoken and finish");
    }
};

}  // namespace codeloom
