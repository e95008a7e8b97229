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

    // Goes on in a part of a text, before its first line: whether an import from the future defers
    // annotations, and whether a class is around it, which is scope 1 then.
    void Resume(bool defers_annotations, bool is_in_class);
    // Around the line that was entered last.
    uint32_t ScopeAround(const CBlockTracker& blocks) { return _fBlocks.ScopeOf(blocks); }
    // Whether an import from the future defers annotations.
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
