// Nodes into short texts, as names are recorded with them: `a.b.c`, `f(x)`.
//   in     a node, and options that say how much of brackets, strings and arguments is shown
//   out    UTF-8; none for what can't be rendered
//   keeps  its three options, so that one converter serves any number of nodes
//   start  at CNodeToTextConverterImpl::AppendTextForNode
#pragma once

#include <string>

#include "host/or_none.h"
#include "tree/atom_nodes.h"

namespace codeloom {

// What a text is wanted for.
struct CNodeTextOptions {
    bool dotted_name_only = false;        // `a.b` alone: cut at the first call or subscript
    bool discard_simple_parens = true;    // `a` for `(a)`
    bool literal_only = false;            // no names but None, True and False
    bool add_parens_if_operator = false;  // `(a + b)`
};

// The interface; the base renders nothing.
class CNodeToTextConverter : public CHosted {
  public:
    void Init() {}

    OPERATIONS_OF(CNodeToTextConverter, CNoOperations)
    OPERATION(CBytesOrNone, TextForNode,
              (CNode& node, bool dotted_name_only = false, bool discard_simple_parens = true,
               bool literal_only = false, bool add_parens_if_operator = false),
              "The text of a node as UTF-8; None for what can't be rendered. With `dotted_name_only` a chain "
              "ends before its first call or subscript, and what isn't a name or a chain gives None. With "
              "`literal_only` a plain name gives None.",
              "node"_a, "dotted_name_only"_a = false, "discard_simple_parens"_a = true,
              "literal_only"_a = false, "add_parens_if_operator"_a = false);
    END_OPERATIONS
};

// Appends what an operation of a host gave; false for none, TypeError for what isn't text.
bool AppendHostText(std::string& text, const nb::object& host_text);

class CNodeToTextConverterImpl : public CNodeToTextConverter {
  public:
    void Init(bool include_bracket_text, bool include_string_contents, bool include_arg_text);

    CBytesOrNone TextForNode(CNode& node, bool dotted_name_only = false, bool discard_simple_parens = true,
                             bool literal_only = false, bool add_parens_if_operator = false) override;
    OPERATIONS_OF(CNodeToTextConverterImpl, CNodeToTextConverter)
    OPERATION(nb::bytes, _TextForStringLiteral, (CStringLiteral& node),
              "The text of a string literal as UTF-8: its own where that is wanted and harmless, else a "
              "pair of quotes with the mark of its kind.",
              "node"_a);
    OPERATION(CBytesOrNone, TextForAtomPlusTrailers,
              (CNode& atom, const CNodeRange& trailers, bool dotted_name_only = false,
               bool discard_simple_parens = true, bool literal_only = false),
              "The text of an atom and the trailers after it as UTF-8; None when the atom has none. "
              "ValueError for a trailer that begins with none of `.`, `(` and `[`.",
              "atom"_a, "trailers"_a, "dotted_name_only"_a = false, "discard_simple_parens"_a = true,
              "literal_only"_a = false);

    template <class Below>
    class TOfHost : public Below {
      public:
        bool AppendTextForNode(std::string& text, CNode& node, const CNodeTextOptions& options) override {
            return AppendHostText(
                text, this->TextForNode(node, options.dotted_name_only, options.discard_simple_parens,
                                        options.literal_only, options.add_parens_if_operator));
        }
        void AppendTextForStringLiteral(std::string& text, CStringLiteral& node) override {
            AppendHostText(text, this->_TextForStringLiteral(node));
        }
        bool AppendTextForAtomPlusTrailers(std::string& text, CNode& atom, const CNodeRange& trailers,
                                           const CNodeTextOptions& options) override {
            return AppendHostText(
                text, this->TextForAtomPlusTrailers(atom, trailers, options.dotted_name_only,
                                                    options.discard_simple_parens, options.literal_only));
        }
    };
    FOR_HOST_SUBCLASSES(TOfHost)
    END_OPERATIONS

    // The operations as native code calls them: they append to `text`, and answer false for none, which
    // leaves `text` with an unfinished piece. A converter of a host subclass goes through its overrides.
    virtual bool AppendTextForNode(std::string& text, CNode& node, const CNodeTextOptions& options = {});
    virtual void AppendTextForStringLiteral(std::string& text, CStringLiteral& node);
    virtual bool AppendTextForAtomPlusTrailers(std::string& text, CNode& atom, const CNodeRange& trailers,
                                               const CNodeTextOptions& options = {});

    // Appends what the trailers after a text add to it.
    void AppendTextForTrailers(std::string& text, const CNodeRange& trailers,
                               const CNodeTextOptions& options = {});

    bool _fIncludeBracketText = false;     // what is in `[...]`, `{...}` and `(...)`
    bool _fIncludeStringContents = false;  // strings of harmless characters as written
    bool _fIncludeArgText = false;         // the arguments of a call

  private:
    bool _AppendLeaf(std::string& text, CNode& leaf, const CNodeTextOptions& options);
    bool _AppendAtom(std::string& text, CAtom& atom, const CNodeTextOptions& options);
    void _AppendFirstString(std::string& text, CAtom& atom);
    template <class Chain>
    bool _AppendChain(std::string& text, Chain& chain, const CNodeTextOptions& options);
    bool _AppendJoinedChildren(std::string& text, CNode& node, const CNodeTextOptions& options);
    bool _AppendTrailer(std::string& text, CTrailer& trailer, const CNodeTextOptions& options);
    void _AppendNested(std::string& text, CTrailer& trailer, std::string_view brackets, bool with_contents);
};

void BindNodeToText(nb::module_& module);

}  // namespace codeloom
