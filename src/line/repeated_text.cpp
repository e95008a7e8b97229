#include "line/repeated_text.h"

#include <algorithm>
#include <vector>

#include "text/char_class.h"
#include "text/token_type.h"

namespace codeloom {

namespace {

// The token is between two chains: it isn't part of a name, or it is a word that joins expressions.
bool EndsChain(const CRawToken& token) {
    if (token.type != kTokenId_NAME) return true;
    switch (token.word) {
        case EWord::kAnd:
        case EWord::kAs:
        case EWord::kElse:
        case EWord::kFor:
        case EWord::kIf:
        case EWord::kImport:
        case EWord::kIn:
        case EWord::kIs:
        case EWord::kLambda:
        case EWord::kNot:
        case EWord::kOr:
            return true;
        default:
            return false;
    }
}

// The word that the statement begins with, `async` apart.
EWord HeadOf(const CRawLogical& part) {
    for (const CRawToken& token : part.tokens)
        if (!IsPassedOver(token) && token.word != EWord::kAsync) return token.word;
    return EWord::kNone;
}

// Goes over the tokens of a line. Lengths are those of the tokens before.
class CRepeatedText {
  public:
    explicit CRepeatedText(const CRawLogical& part) : _fPart(part), _fHead(HeadOf(part)) {}

    size_t Measure() {
        for (size_t i = 0; i < _fPart.tokens.size(); ++i) {
            if (!IsPassedOver(_fPart.tokens[i])) _Visit(i);
        }
        return _fTextOfChains + std::max(_fTextForTargets, _fTextOfCopies);
    }

  private:
    // One pair of brackets, or what is outside all.
    struct CFrame {
        size_t chain_start = 0;  // of the chain under way
        size_t start = 0;
        bool is_of_isinstance = false;
        size_t first_argument = 0;   // its length, once the comma after it is passed
        size_t commas_up_to_it = 0;  // that comma included
    };

    void _Visit(size_t token_i) {
        const CRawToken& token = _fPart.tokens[token_i];
        const std::string_view text = _fPart.Text(token);
        if (token.type == kTokenId_DOT) {
            _fTextOfChains += _fLength - _fFrames.back().chain_start;
        } else if (ByteKind(text.front()) == EByteKind::kOpener) {
            _fFrames.push_back({_fLength + 1, _fLength + 1, _fLast == "isinstance"});
        } else if (ByteKind(text.front()) == EByteKind::kCloser) {
            _Close();
        } else if (token.type == kTokenId_COMMA) {
            _VisitComma();
        } else if (EndsChain(token)) {
            _fFrames.back().chain_start = _fLength;
        }
        _fLength += text.size();
        _fLast = text;
        if (_fFrames.size() == 1) _VisitSeparator(token, token_i);
    }

    void _VisitComma() {
        CFrame& frame = _fFrames.back();
        frame.chain_start = _fLength;
        ++_fCommaCount;
        if (frame.commas_up_to_it != 0) return;
        frame.commas_up_to_it = _fCommaCount;
        frame.first_argument = _fLength - frame.start;
    }

    void _Close() {
        if (_fFrames.size() == 1) return;
        const CFrame& frame = _fFrames.back();
        if (frame.is_of_isinstance && frame.commas_up_to_it != 0)
            _fTextOfChains += frame.first_argument * (_fCommaCount - frame.commas_up_to_it);
        _fFrames.pop_back();
    }

    // Between targets and the value that each of them gets; about half of the tokens on their side are
    // targets.
    void _VisitSeparator(const CRawToken& token, size_t token_i) {
        if (token.type == kTokenId_EQUAL) {
            _fTextForTargets = (token_i + 1) / 2 * (_TotalLength() - _fLength);
        } else if (token.word == EWord::kIn && _fHead == EWord::kFor) {
            _NoteCopies((token_i + 1) / 2 * (_TotalLength() - _fLength));
        } else if ((token.word == EWord::kAs && _fHead == EWord::kWith) ||
                   (token.word == EWord::kImport && _fHead == EWord::kFrom)) {
            _NoteCopies((_fPart.tokens.size() - token_i) / 2 * _TotalLength());
        }
    }

    void _NoteCopies(size_t length) { _fTextOfCopies = std::max(_fTextOfCopies, length); }

    size_t _TotalLength() {
        if (_fTotalLength == 0)
            for (const CRawToken& token : _fPart.tokens) _fTotalLength += _fPart.Text(token).size();
        return _fTotalLength;
    }

    const CRawLogical& _fPart;
    const EWord _fHead;
    std::vector<CFrame> _fFrames = std::vector<CFrame>(1);
    size_t _fLength = 0;
    size_t _fTotalLength = 0;
    size_t _fCommaCount = 0;
    std::string_view _fLast;
    size_t _fTextOfChains = 0;
    size_t _fTextForTargets = 0;
    size_t _fTextOfCopies = 0;
};

}  // namespace

size_t RepeatedText(const CRawLogical& part) {
    return CRepeatedText(part).Measure();
}

}  // namespace codeloom
