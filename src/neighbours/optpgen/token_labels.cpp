#include "neighbours/optpgen/token_labels.h"

#include <algorithm>
#include <cstring>

#include "host/hosted.h"
#include "host/text.h"

namespace codeloom {

namespace {

std::string_view AsciiView(nb::handle text) {
    return {static_cast<const char*>(PyUnicode_DATA(text.ptr())),
            static_cast<size_t>(PyUnicode_GET_LENGTH(text.ptr()))};
}

unsigned char FirstByte(nb::handle keyword) {
    return static_cast<unsigned char>(AsciiView(keyword).front());
}

bool IsSameText(nb::handle a, nb::handle b) {
    return a.is(b) || PyUnicode_Compare(a.ptr(), b.ptr()) == 0;
}

}  // namespace

void CKeywords::Add(const std::string& text, int label) {
    _fKeywords.push_back({InternedText(text), label});
}

void CKeywords::Seal() {
    std::sort(_fKeywords.begin(), _fKeywords.end(),
              [](const CKeyword& a, const CKeyword& b) { return AsciiView(a.text) < AsciiView(b.text); });
    for (const CKeyword& keyword : _fKeywords) ++_fStarts[FirstByte(keyword.text) + 1];
    for (size_t byte = 1; byte < _fStarts.size(); ++byte) _fStarts[byte] += _fStarts[byte - 1];
    size_t slot_count = 8;
    while (slot_count < 8 * _fKeywords.size()) slot_count *= 2;  // sparse, so that most searches end at once
    _fSlots.resize(slot_count);
    _fSlotMask = slot_count - 1;
    for (const CKeyword& keyword : _fKeywords) {
        size_t slot = _Slot(keyword.text) & _fSlotMask;
        while (_fSlots[slot].text.is_valid()) slot = (slot + 1) & _fSlotMask;
        _fSlots[slot] = {keyword.text, keyword.label};
    }
}

int CKeywords::_FindContent(nb::handle text) const {
    if (PyUnicode_READY(text.ptr()) < 0) throw nb::python_error();
    if (!PyUnicode_IS_ASCII(text.ptr()) || PyUnicode_GET_LENGTH(text.ptr()) == 0) return -1;
    const std::string_view ascii = AsciiView(text);
    const auto first = static_cast<unsigned char>(ascii.front());
    for (size_t i = _fStarts[first]; i < _fStarts[first + 1]; ++i)
        if (AsciiView(_fKeywords[i].text) == ascii) return _fKeywords[i].label;
    return -1;
}

CTokenLabels::CTokenLabels(const CGrammarRules& rules, const CParseTables& tables,
                           const CTokenTypes& token_types)
    : _fUnknownLabel(tables.UnknownLabel()) {
    _fLabels.fill(static_cast<int16_t>(_fUnknownLabel));
    if (const auto name = token_types.type_of_name.find("NAME"); name != token_types.type_of_name.end())
        _fNameType = name->second;
    std::array<bool, CTokenTypes::kLimit> text_decides{};
    for (size_t i = 0; i < rules.Terminals().size(); ++i) {
        const CTerminal& terminal = rules.Terminals()[i];
        const int label = tables.LabelOfTerminal(static_cast<int>(i));
        if (terminal.text.empty()) {
            _fLabels[terminal.type] = static_cast<int16_t>(label);
            continue;
        }
        text_decides[terminal.type] = true;
        if (terminal.type == _fNameType) {
            _fKeywords.Add(terminal.text, label);
        } else {
            _fOperators.push_back({terminal.type, InternedText(terminal.text), label});
        }
    }
    _fKeywords.Seal();
    for (size_t type = 0; type < _fLabels.size(); ++type)
        if (text_decides[type]) _fLabels[type] += kTextDecides;
}

int CTokenLabels::_FindOperator(int type, nb::handle value) const {
    for (const COperator& candidate : _fOperators)
        if (candidate.type == type && IsSameText(candidate.text, value)) return candidate.label;
    return -1;
}

// The label of a token without a text, or with one of a subclass of the host's text strings.
int CTokenLabels::_FindUnusual(int type, nb::handle value) const {
    const int label = _LabelOfType(type);
    if (value.is_none()) return label < kTextDecides ? label : label - kTextDecides;
    if (!PyUnicode_Check(value.ptr())) RaiseWrongType("str", value);
    return label < kTextDecides ? label : _FindByText(type, value);
}

}  // namespace codeloom
