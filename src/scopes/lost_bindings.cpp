#include "scopes/lost_bindings.h"

#include "syntax/token_span.h"

namespace codeloom {

namespace {

bool IsPlainName(const CRawToken& token) {
    return token.type == kTokenId_NAME && token.word == EWord::kNone;
}

class CLostBindingFinder {
  public:
    explicit CLostBindingFinder(const CRawLogical& line) {
        for (const CRawToken& token : line.tokens)
            if (!IsPassedOver(token)) _fTokens.push_back(&token);
    }

    CLostBindings Find(EClause clause) {
        if (clause == EClause::kDef || clause == EClause::kAsyncDef) {
            _FindAfter(EWord::kDef);
            _FindParameters();
        } else if (clause == EClause::kClass) {
            _FindAfter(EWord::kClass);
        } else if (_IsWord(0, EWord::kImport) || _IsWord(0, EWord::kFrom)) {
            _FindImports();
        } else {
            _FindAfter(EWord::kAs);
            _FindLoopTargets();
            if (clause == EClause::kSimple) _FindTargets();
        }
        return std::move(_fFound);
    }

  private:
    bool _IsType(size_t i, int type) const { return i < _fTokens.size() && _fTokens[i]->type == type; }
    bool _IsWord(size_t i, EWord word) const { return i < _fTokens.size() && _fTokens[i]->word == word; }
    bool _IsName(size_t i) const { return i < _fTokens.size() && IsPlainName(*_fTokens[i]); }

    // A name that isn't part of a chain.
    bool _IsTarget(size_t i) const {
        return _IsName(i) && (i == 0 || !_IsType(i - 1, kTokenId_DOT)) && !_IsType(i + 1, kTokenId_DOT) &&
               !_IsType(i + 1, kTokenId_LPAR) && !_IsType(i + 1, kTokenId_LSQB);
    }

    void _FindAfter(EWord word) {
        for (size_t i = 0; i + 1 < _fTokens.size(); ++i)
            if (_IsWord(i, word) && _IsName(i + 1)) _fFound.names.push_back(_fTokens[i + 1]);
    }

    // Those right in the first parentheses that begin a parameter.
    void _FindParameters() {
        int depth = 0;
        bool begins = false;
        for (size_t i = 0; i < _fTokens.size(); ++i) {
            depth += DepthStep(*_fTokens[i]);
            if (depth == 1 && begins && _IsName(i)) _fFound.parameters.push_back(_fTokens[i]);
            const bool is_star = _IsType(i, kTokenId_STAR) || _IsType(i, kTokenId_DOUBLESTAR);
            begins = _IsType(i, kTokenId_LPAR) || _IsType(i, kTokenId_COMMA) || (begins && is_star);
        }
    }

    void _FindImports() {
        bool is_imported = false, begins = false;
        for (size_t i = 0; i < _fTokens.size(); ++i) {
            if (is_imported && begins && _IsName(i) && !_IsWord(i + 1, EWord::kAs))
                _fFound.names.push_back(_fTokens[i]);
            is_imported |= _IsWord(i, EWord::kImport);
            begins = _IsWord(i, EWord::kImport) || _IsWord(i, EWord::kAs) || _IsType(i, kTokenId_COMMA) ||
                     _IsType(i, kTokenId_LPAR);
        }
    }

    void _FindLoopTargets() {
        if (!_IsWord(0, EWord::kFor) && !_IsWord(1, EWord::kFor)) return;
        for (size_t i = 1; i < _fTokens.size() && !_IsWord(i, EWord::kIn); ++i)
            if (_IsTarget(i)) _fFound.names.push_back(_fTokens[i]);
    }

    // What comes before the last `=` outside brackets, or before the `:` of an annotation.
    void _FindTargets() {
        size_t end = _IsName(0) && _IsType(1, kTokenId_COLON) ? 1 : 0;
        int depth = 0;
        for (size_t i = 0; end != 1 && i < _fTokens.size(); ++i) {
            depth += DepthStep(*_fTokens[i]);
            if (depth == 0 && _IsType(i, kTokenId_EQUAL)) end = i;
        }
        for (size_t i = 0; i < end; ++i)
            if (_IsTarget(i)) _fFound.names.push_back(_fTokens[i]);
    }

    std::vector<const CRawToken*> _fTokens;
    CLostBindings _fFound;
};

}  // namespace

CLostBindings FindLostBindings(const CRawLogical& line, EClause clause) {
    return CLostBindingFinder(line).Find(clause);
}

}  // namespace codeloom
