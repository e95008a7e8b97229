// The text of a chain up to one of its trailers. It grows with the visit from left to right, so that the
// names of a chain cost their own length and not that of all before them once more.
#pragma once

#include <string>

#include "host/text.h"
#include "tree/node_to_text.h"

namespace codeloom {

class CChainText {
  public:
    // Good as long as the chain, which the caller visits.
    CChainText(CNodeToTextConverterImpl& converter, CNode& atom, const CNodeRange& trailers)
        : _fConverter(converter), _fAtom(atom), _fTrailers(trailers) {}

    bool IsOf(const CNode& atom, const CNodeRange& trailers) const {
        return &atom == &_fAtom && trailers.BeginsLike(_fTrailers);
    }

    // The text of the atom and the first `count` trailers; none when it has none.
    CTextOrNone UpTo(Py_ssize_t count) {
        if (count < _fCount || _fText.empty()) {
            _fText.clear();
            _fCount = count;
            if (!_fConverter.AppendTextForAtomPlusTrailers(_fText, _fAtom, _fTrailers.First(count))) {
                _fText.clear();  // it may hold an unfinished piece
                return CTextOrNone();
            }
        }
        _fConverter.AppendTextForTrailers(_fText, _fTrailers.Between(_fCount, count));
        _fCount = count;
        return TextFromUtf8(_fText);
    }

  private:
    CNodeToTextConverterImpl& _fConverter;
    CNode& _fAtom;
    const CNodeRange& _fTrailers;
    std::string _fText;
    Py_ssize_t _fCount = 0;  // of the trailers in the text
};

}  // namespace codeloom
