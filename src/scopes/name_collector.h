// The names of a text, line by line, as the pass over it goes on.
#pragma once

#include "occurrences/occurrence_finder.h"
#include "rules/blocks.h"
#include "scopes/block_scopes.h"
#include "scopes/text_names.h"

namespace codeloom {

class CNameCollector {
  public:
    // Whether a line is in doubt matters only where names may be declared.
    CNameCollector(const CLanguage& language, bool may_declare_names, CTextNames& names)
        : _fNames(names), _fFinder(language, names.occurrences), _fMayDeclareNames(may_declare_names) {}

    // Call for every line, in order. The blocks around a comment are those of the line before.
    void BeginLine(const CRawLogical& line, const CBlockTracker& blocks);
    void Take(const CRawLogical& part, const CTree& tree) { _fFinder.Take(part, tree); }
    void TakeHint(const CTree& tree, const CTreeNode& node, uint32_t shift) {
        _fFinder.TakeHint(tree, node, shift);
    }
    void EndLine(const CRawLogical& line, bool has_fault, const CBlockTracker& blocks);

    // Call once, after the last line. Scopes are then to be built.
    void Finish();

    // Whether an import from the future defers annotations: what came before a part of a text says so.
    void SetDefersAnnotations(bool defers) { _fFinder.SetDefersAnnotations(defers); }
    bool DefersAnnotations() const { return _fFinder.HasDeferredAnnotations(); }

  private:
    void _NoteLostLine(const CRawLogical& line, EClause clause, uint32_t opened_scope);
    uint32_t _AddLostScope(const CRawLogical& line, const CStatementHead& head);

    CTextNames& _fNames;
    COccurrenceFinder _fFinder;
    CBlockScopes _fBlocks;
    const bool _fMayDeclareNames;
};

}  // namespace codeloom
