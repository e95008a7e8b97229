// What makes the nodes of a parse. The engine derives its own; everything is inline, since the engine is an
// extension of its own.
#pragma once

#include <nanobind/nanobind.h>

#include "host/overrides.h"
#include "neighbours/optpgen/object_stack.h"

namespace codeloom {

class NodeConverter : public CHosted {
  public:
    void Init() {}

    // The node of a token (children none, `type` below 256) or of a rule (value none, `type` its number,
    // context that of its first token). Here it is the tuple of the last four arguments.
    OPERATIONS_OF(NodeConverter, CNoOperations)
    OPERATION(
        nb::object, convert,
        (nb::handle grammar, int type, nb::handle value, nb::handle context, nb::handle children),
        "Make the node of a token or of a rule; what it returns is what the rule above gets as a child.\n\n"
        "Called once for each token that the grammar takes, with its type (int), text (str) and context\n"
        "(any object) and None as children, and once for each rule that is complete, with the rule's\n"
        "number, None as value, the context of its first token and the list of its children. This one\n"
        "returns the tuple (type, value, context, children).",
        "grammar"_a.none(), "type"_a, "value"_a.none(), "context"_a.none(), "children"_a.none()) {
        static_cast<void>(grammar);
        return nb::make_tuple(type, value, context, children);
    }

    template <class Below>
    class TOfHost : public Below {
      public:
        // A host subclass knows rules by `convert` alone.
        nb::object ConvertRule(nb::handle grammar, int type, nb::handle context, CObjectStack& stack,
                               size_t first) override {
            return this->convert(grammar, type, nb::none(), context, stack.PopList(first));
        }
    };
    FOR_HOST_SUBCLASSES(TOfHost)
    END_OPERATIONS

    // The same for a rule whose children are on a stack, from `first` to its top; they leave it. A native
    // converter that needs no list of them has its own; all of them come from that converter then.
    virtual nb::object ConvertRule(nb::handle grammar, int type, nb::handle context, CObjectStack& stack,
                                   size_t first) {
        return convert(grammar, type, nb::none(), context, stack.PopList(first));
    }
};

}  // namespace codeloom
