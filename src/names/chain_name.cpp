#include "names/chain_name.h"

namespace codeloom {

void CChainName::MoveTo(size_t i) {
    const CTreeNode& trailer = _fChain.trailers[i];
    const CRawToken& dot = _fTree.Token(_fTree.Child(trailer, 0));
    const CRawToken& name = _fTree.Token(_fTree.Child(trailer, 1));
    _fIsInSource = _fIsInSource && is_dotted && dot.start == place.end && name.start == dot.start + 1;
    place.end = name.start + name.length;
}

std::string_view CChainName::_Rendered(size_t i) {
    CNodeText text(_fTree);
    if (_fCount == 0) {
        text.AppendChain({_fChain.atom, _fChain.trailers.first(i + 1), false}, _fScratch);
        _fCount = i + 1;
    }
    for (; _fCount <= i; ++_fCount) text.AppendTrailer(_fChain.trailers[_fCount], _fScratch);
    return _fScratch.From(_fStart);
}

}  // namespace codeloom
