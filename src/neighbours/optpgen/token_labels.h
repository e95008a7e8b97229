// From a token to the label that the tables know it by.
//   in     token type and token text
//   out    a label; none for a token that the grammar doesn't have
// The type decides. The text is looked at in two cases: a name may be a keyword, and two operators may share
// a type.
#pragma once

#include <array>
#include <vector>

#include <nanobind/nanobind.h>

#include "grammar/grammar_rules.h"
#include "grammar/parse_tables.h"

namespace nb = nanobind;

namespace codeloom {

// The keywords of a grammar. An interned text is found or ruled out by identity alone, since the keywords are
// interned too; another text by its first byte and length.
class CKeywords {
  public:
    void Add(const std::string& text, int label);
    void Seal();  // call once, after the last Add

    // The label of the keyword `text`, a text string; -1 when it isn't one.
    int Find(nb::handle text) const {
        return PyUnicode_CHECK_INTERNED(text.ptr()) ? _FindIdentity(text) : _FindContent(text);
    }

  private:
    struct CKeyword {
        nb::object text;
        int label;
    };

    static size_t _Slot(nb::handle text) { return reinterpret_cast<uintptr_t>(text.ptr()) >> 4; }
    int _FindIdentity(nb::handle text) const {
        for (size_t slot = _Slot(text) & _fSlotMask;; slot = (slot + 1) & _fSlotMask) {
            const CSlot& found = _fSlots[slot];
            if (found.text.is(text)) return found.label;
            if (!found.text.is_valid()) return -1;
        }
    }
    int _FindContent(nb::handle text) const;

    struct CSlot {
        nb::handle text;  // owned by _fKeywords
        int label = -1;
    };
    std::vector<CKeyword> _fKeywords;  // by first byte, once sealed
    std::vector<CSlot> _fSlots;
    size_t _fSlotMask = 0;
    std::array<uint16_t, 129> _fStarts{};  // by first byte: where its keywords begin in _fKeywords
};

class CTokenLabels {
  public:
    CTokenLabels(const CGrammarRules& rules, const CParseTables& tables, const CTokenTypes& token_types);

    // The label of a token. `value` is a text string or none, anything else is the host's TypeError.
    int Find(int type, nb::handle value) const {
        if (!PyUnicode_CheckExact(value.ptr())) [[unlikely]]
            return _FindUnusual(type, value);
        const int label = _LabelOfType(type);
        return label < kTextDecides ? label : _FindByText(type, value);
    }

  private:
    // Added to the label of a type where the text may say otherwise.
    static constexpr int kTextDecides = 1 << 14;

    struct COperator {
        int type;
        nb::object text;
        int label;
    };

    int _LabelOfType(int type) const {
        return static_cast<size_t>(type) < _fLabels.size() ? _fLabels[type] : _fUnknownLabel;
    }
    int _FindByText(int type, nb::handle value) const {
        const int label = type == _fNameType ? _fKeywords.Find(value) : _FindOperator(type, value);
        return label < 0 ? _LabelOfType(type) - kTextDecides : label;
    }
    int _FindOperator(int type, nb::handle value) const;
    int _FindUnusual(int type, nb::handle value) const;

    const int _fUnknownLabel;
    int _fNameType = -1;
    std::array<int16_t, CTokenTypes::kLimit> _fLabels;  // by token type
    CKeywords _fKeywords;
    std::vector<COperator> _fOperators;  // that share their type with others
};

}  // namespace codeloom
