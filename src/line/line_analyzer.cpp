#include "line/line_analyzer.h"

#include <algorithm>
#include <vector>

#include "names/name_walker.h"
#include "syntax/line_parser.h"
#include "syntax/tree_observer.h"
#include "syntax/tree_size.h"
#include "typing/hint_walker.h"

namespace codeloom {

class CLineAnalyzer::CImpl {
  public:
    explicit CImpl(const CLanguage& language)
        : _fParser(language), _fNames(language.IsPython3()), _fHints(language.version, _fNames) {}

    CLineResult Analyze(const CRawLogical& line, const CLineRequest& request);

    std::span<const uint32_t> RecordEnds() const { return _fRecordEnds; }
    bool HasMoreToTell() const { return _fHasMoreToTell; }

  private:
    // How many records there were before a part.
    struct CMark {
        size_t records = 0;
        size_t values = 0;
    };

    bool _AnalyzeLine(const CRawLogical& line);
    bool _AnalyzeStatement(const CRawLogical& part);
    bool _AnalyzeEmbedded(const CRawLogical& line);
    bool _IsPassedOver(const CRawLogical& embedded) const;
    bool _Take(const CFault& fault, ELimit limit);
    bool _Take(const CHintResult& hints);
    CHintContext _HintContext() const;
    CMark _Mark() const;
    void _DropFrom(const CMark& mark);
    void _DropArgumentsFrom(const CMark& mark);

    CLineParser _fParser;
    CTree _fTree;
    CTreeSize _fTreeSize;
    CNameWalker _fNames;
    CHintWalker _fHints;

    CLineRequest _fRequest;
    CLineResult _fResult;
    CMark _fStart;  // of the line
    std::vector<uint32_t> _fRecordEnds;
    bool _fHasMoreToTell = false;
};

CLineResult CLineAnalyzer::CImpl::Analyze(const CRawLogical& line, const CLineRequest& request) {
    _fRequest = request;
    _fResult = {};
    _fStart = _Mark();
    _fRecordEnds.clear();
    _fHasMoreToTell = false;
    if (request.false_hints != nullptr) request.false_hints->BeginLine(line);
    if (!_AnalyzeLine(line)) _DropFrom(_fStart);
    return _fResult;
}

// What follows answers false for a line that leaves no records: it has a fault, or its analysis is given up.

bool CLineAnalyzer::CImpl::_AnalyzeLine(const CRawLogical& line) {
    if (line.type == ELogicalType::kComment)
        return !_fRequest.first_in_def || _Take(_fHints.WalkComment(line, _HintContext()));
    if (!_AnalyzeStatement(line)) return false;
    _fRecordEnds.push_back(static_cast<uint32_t>(_Mark().records));
    return line.embedded.empty() || _fTree.fIsEmpty || _AnalyzeEmbedded(line);
}

// The statement of the line, or of a logical embedded in it, with its hints.
bool CLineAnalyzer::CImpl::_AnalyzeStatement(const CRawLogical& part) {
    if (const CFault fault = _fParser.Parse(part, _fRequest.in_async_def, _fTree))
        return _Take(fault, ELimit::kNone);
    if (_fRequest.observer != nullptr) _fRequest.observer->Take(part, _fTree);
    if (_fTree.fIsEmpty) return true;
    if (_fRequest.asks_for_more) _fHasMoreToTell |= !_fTreeSize.IsWithin(_fTree, kMostVisits, kMostDepth);
    const CWalkResult names = _fNames.Walk(_fTree, _fTree.fRoot, _fRequest.records);
    return _Take(names.fault, names.limit) && _Take(_fHints.Walk(_fTree, _HintContext()));
}

bool CLineAnalyzer::CImpl::_AnalyzeEmbedded(const CRawLogical& line) {
    for (const CRawLogical& embedded : line.embedded) {
        const CMark mark = _Mark();
        if (!_IsPassedOver(embedded) && !_AnalyzeStatement(embedded)) {
            _fResult.fault.embedded_i = static_cast<int32_t>(&embedded - line.embedded.data());
            return false;
        }
        _DropArgumentsFrom(mark);
        _fRecordEnds.push_back(static_cast<uint32_t>(_Mark().records));
    }
    return true;
}

// Hints in comments are read where they are.
bool CLineAnalyzer::CImpl::_IsPassedOver(const CRawLogical& embedded) const {
    if (embedded.type == ELogicalType::kCommentedTypeHint) return true;
    return embedded.type == ELogicalType::kStringifiedTypeHint && _fRequest.false_hints != nullptr &&
           _fRequest.false_hints->IsFalseInQuotes(embedded);
}

bool CLineAnalyzer::CImpl::_Take(const CFault& fault, ELimit limit) {
    _fHasMoreToTell |= limit != ELimit::kNone;
    if (_fResult.limit == ELimit::kNone) _fResult.limit = limit;
    _fResult.fault = fault;
    return !fault;
}

bool CLineAnalyzer::CImpl::_Take(const CHintResult& hints) {
    _fHasMoreToTell |= hints.is_given_up || hints.is_deep;
    return _Take(hints.fault, hints.limit) && !hints.is_given_up;
}

CHintContext CLineAnalyzer::CImpl::_HintContext() const {
    return {_fRequest.records, _fStart.records, _fRequest.false_hints, _fRequest.observer};
}

CLineAnalyzer::CImpl::CMark CLineAnalyzer::CImpl::_Mark() const {
    if (_fRequest.records == nullptr) return {};
    return {_fRequest.records->records.size(), _fRequest.records->values.size()};
}

void CLineAnalyzer::CImpl::_DropFrom(const CMark& mark) {
    if (_fRequest.records == nullptr) return;
    _fRequest.records->records.CutTo(mark.records);
    _fRequest.records->values.CutTo(mark.values);
}

// Records of arguments stay with the embedded logical that they are about, which isn't part of the text's
// records. Only a statement where an expression should be has any.
void CLineAnalyzer::CImpl::_DropArgumentsFrom(const CMark& mark) {
    if (_fRequest.records == nullptr) return;
    TPlainArray<CRecord>& records = _fRequest.records->records;
    CRecord* const kept = std::remove_if(records.begin() + mark.records, records.end(),
                                         [](const CRecord& record) { return record.of_arg; });
    _fHasMoreToTell |= kept != records.end();
    records.CutTo(static_cast<size_t>(kept - records.begin()));
}

CLineAnalyzer::CLineAnalyzer(const CLanguage& language) : _fImpl(std::make_unique<CImpl>(language)) {}

CLineAnalyzer::~CLineAnalyzer() = default;

CLineResult CLineAnalyzer::Analyze(const CRawLogical& line, const CLineRequest& request) {
    return _fImpl->Analyze(line, request);
}

std::span<const uint32_t> CLineAnalyzer::RecordEnds() const {
    return _fImpl->RecordEnds();
}

bool CLineAnalyzer::HasMoreToTell() const {
    return _fImpl->HasMoreToTell();
}

}  // namespace codeloom
