// occurrences/: every appearance of a name on one logical line.
//   in     the trees of the line and of what is embedded in it, and those of hints in its comments
//   out    occurrences, by their place, each with its role and the scope within the line; the scopes that
//          begin on the line
//   keeps  whether the text defers its annotations, and storage
//   start  at COccurrenceFinder, then the switch in occurrence_finder.cpp
//
// definitions.cpp    `def`, `lambda`, `class`, comprehensions, type parameters, annotations
// statements.cpp     assignments, imports, `case`, and other statements that bind
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "occurrences/occurrences.h"
#include "syntax/arguments.h"
#include "syntax/expressions.h"
#include "syntax/language.h"
#include "syntax/nodes.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

class COccurrenceFinder {
  public:
    COccurrenceFinder(const CLanguage& language, COccurrences& found)
        : _fLanguage(language), _fFound(found), _fNoName(found.names->Number({})) {}

    // True after an import from the future that defers annotations, which may come before a part of a text.
    bool HasDeferredAnnotations() const { return _fHasDeferredAnnotations; }
    void SetDefersAnnotations(bool defers) { _fHasDeferredAnnotations = defers; }

    // Call for every line, in order.
    void BeginLine(const CRawLogical& line);

    // The tree of the line, then those of what is embedded in it.
    void Take(const CRawLogical& part, const CTree& tree);

    // A part of a tree made of a hint in a comment: `shift` leads from its places to those in the file.
    void TakeHint(const CTree& tree, const CTreeNode& node, uint32_t shift);

    // The scope that the line's header opens for the block after it, counted as that of an occurrence; zero
    // for a line without one.
    uint32_t OpenedScope() const { return _fOpenedScope; }

    // Call for every line at its end. One with a fault leaves nothing.
    void EndLine(bool has_fault);

  private:
    // A string literal that may hold embedded expressions, and where it was met.
    struct CString {
        uint32_t start;
        uint32_t end;
        uint32_t scope;
        uint8_t flags;
    };

    static constexpr int kMostDepth = 400;  // deeper than any text that the interpreter takes

    void _Visit(const CTreeNode& node) {
        if (!node.IsLeaf()) return _VisitInner(node);
        if (node.Is(ENodeKind::kNameLiteral)) {
            if (!_IsValue(node)) _Add(node, ERole::kRead);
        } else if (_fHasEmbedded && node.Is(ENodeKind::kStringLiteral)) {
            _NoteString(node);
        }
    }
    void _VisitInner(const CTreeNode& node);
    void _Dispatch(const CTreeNode& node);
    void _VisitChildren(const CTreeNode& node);
    void _VisitIn(uint32_t scope, const CTreeNode& node);
    void _VisitTarget(const CTreeNode& node, ERole role);
    void _VisitTargetAtom(const CTreeNode& node, ERole role);
    void _VisitChain(const CChain& chain, ERole last_role);
    void _VisitDottedName(const CTreeNode& node, ERole first_role, ERole next_role);
    void _VisitArgument(const CTreeNode& node);
    void _NoteString(const CTreeNode& leaf);

    // Scopes
    void _VisitFuncdef(const CTreeNode& node, uint32_t header_scope);
    void _VisitParameters(const CTreeNode& node, uint32_t scope, uint32_t header_scope);
    void _VisitLambda(const CTreeNode& node);
    void _VisitClassdef(const CTreeNode& node, uint32_t header_scope);
    void _VisitGeneric(const CTreeNode& node);
    void _VisitTypeParameter(const CTreeNode& node, uint32_t scope);
    void _VisitTypeVariable(const CTreeNode& name, const CTreeNode& spec);
    void _VisitAlias(const CTreeNode& name, const CTreeNode& value);
    void _VisitAnnotation(const CTreeNode& node, uint32_t header_scope);
    bool _VisitComprehension(const CTreeNode& owner);
    void _VisitClauses(const CTreeNode& first, uint32_t outer_scope);
    EScopeKind _ComprehensionKind(const CTreeNode& owner) const;
    uint32_t _AddScope(EScopeKind kind, uint32_t name, uint32_t parent, const CTreeNode& node);
    uint32_t _AddAnnotationScope(uint32_t parent, const CTreeNode& node, bool is_text);
    bool _DefersAnnotations() const;
    bool _IsInAnnotation(uint32_t scope) const;

    // Statements
    void _VisitExprStmt(const CTreeNode& node);
    void _VisitAnnotatedAssign(const CTreeNode& target, const CTreeNode& annotated);
    void _VisitFor(const CTreeNode& node);
    void _VisitExcept(const CTreeNode& node);
    void _VisitImport(const CTreeNode& node);
    void _VisitFromImport(const CTreeNode& node);
    void _VisitDeclared(const CTreeNode& node, ERole role);
    void _VisitCase(const CTreeNode& node);
    void _VisitPattern(const CTreeNode& node);

    COccurrence& _Add(const CTreeNode& leaf, ERole role);
    // The same where the grammar takes more than a name, which the rules refuse: that is visited.
    void _AddName(const CTreeNode& node, ERole role, uint8_t flags);
    COccurrence& _AddAttribute(const CTreeNode& leaf, ERole role, uint32_t object_start, uint32_t object_end);
    uint32_t _NumberOf(const CTreeNode& leaf) { return _fFound.names->Number(_fTree->Text(leaf)); }
    bool _IsValue(const CTreeNode& name) const;

    const CLanguage& _fLanguage;
    COccurrences& _fFound;
    const uint32_t _fNoName;
    bool _fHasDeferredAnnotations = false;  // asked for by an import from the future

    // State of the line
    size_t _fFirstItem = 0;
    size_t _fFirstScope = 0;
    uint32_t _fOpenedScope = 0;
    const CRawLogical* _fLine = nullptr;
    bool _fHasEmbedded = false;
    bool _fHasParts = false;  // embedded ones or hints in comments, whose names come after those of the line
    std::vector<CString> _fStrings;

    // State of the tree that is being visited
    const CTree* _fTree = nullptr;
    uint32_t _fScope = 0;
    uint8_t _fFlags = 0;
    uint32_t _fShift = 0;
    int _fDepth = 0;
    int16_t _fBracket = 0;           // the token type that opens the innermost brackets
    uint32_t _fAnnotationScope = 0;  // of the header under way; zero until it is needed
};

}  // namespace codeloom
