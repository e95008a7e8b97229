// What a chain is up to one of its trailers, as the visit goes on from left to right. The text grows with it,
// so that each name of a chain costs its own length, not that of all the ones before.
#pragma once

#include <string_view>

#include "names/node_text.h"

namespace codeloom {

class CChainName {
  public:
    static constexpr uint32_t kNoNumber = UINT32_MAX;

    // The text grows at the end of `scratch`, which is as before once the object is gone. Others may use it
    // in between, likewise.
    CChainName(const CTree& tree, const CChain& chain, CTextBuffer& scratch)
        : _fTree(tree), _fChain(chain), _fScratch(scratch), _fStart(scratch.size()) {
        if (!chain.atom->Is(ENodeKind::kNameLiteral)) {
            place = SpanOfLeaf(tree, *chain.atom);
            return;
        }
        is_dotted = _fIsInSource = true;
        const CRawToken& token = tree.Token(*chain.atom);
        place = {token.start, token.start + token.length};
    }
    ~CChainName() { _fScratch.CutTo(_fStart); }
    CChainName(const CChainName&) = delete;
    CChainName& operator=(const CChainName&) = delete;

    // Goes on to the trailer at `i`, which is `.name`.
    void MoveTo(size_t i);

    // The text of the atom and the trailers up to the one at `i`, to which the name has gone on.
    std::string_view UpTo(size_t i) {
        if (_fIsInSource) return {_fTree.Line().file_text.data() + place.start, place.end - place.start};
        return _Rendered(i);
    }

    CSpan place;                  // from the atom to the last `.name`
    uint32_t number = kNoNumber;  // of the name; none where nobody has asked for it
    bool is_dotted = false;       // a name, or names with dots between them

  private:
    std::string_view _Rendered(size_t i);

    const CTree& _fTree;
    const CChain& _fChain;
    CTextBuffer& _fScratch;
    const size_t _fStart;       // in the scratch
    size_t _fCount = 0;         // of the trailers in the scratch
    bool _fIsInSource = false;  // the source has the text as it is, without blanks or rows between
};

}  // namespace codeloom
