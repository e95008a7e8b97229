// The functions of an analysis with their parameters, and its type hints, as objects.
#pragma once

#include "face/items.h"

namespace codeloom {

struct CHintItem : CItem {
    using CItem::CItem;
    static constexpr const char* kSequence = "hints";

    const CHintInfo& Data() const { return file->Signatures().hints[i]; }
    CRange Range() const { return RangeOfBytes(*file, Data().hint.start, Data().hint.end); }
    CRange Target() const { return RangeOfBytes(*file, Data().target.start, Data().target.end); }
    CLineItem Line() const { return {file, Data().line}; }
    bool operator==(const CHintItem& other) const;
    size_t Hash() const { return Data().hint.start; }
};

struct CParameterItem : CItem {
    using CItem::CItem;

    const CSignatureParameter& Data() const { return file->Signatures().parameters[i]; }
    CRange Range() const { return RangeOfBytes(*file, Data().name.start, Data().name.end); }
    nb::object Default() const;
    nb::object Hint() const;
    bool operator==(const CParameterItem& other) const;
    size_t Hash() const { return Data().name.start; }
};

struct CSignatureItem : CItem {
    using CItem::CItem;
    static constexpr const char* kSequence = "signatures";

    const CSignature& Data() const { return file->Signatures().items[i]; }
    CRange Range() const { return RangeOfBytes(*file, Data().name.start, Data().name.end); }
    CLineItem Line() const { return {file, Data().line}; }
    nb::object Parameters() const;
    nb::object ReturnHint() const;
    bool operator==(const CSignatureItem& other) const;
    size_t Hash() const { return Data().name.start; }
};

using CHintItems = TItems<CHintItem>;
using CSignatureItems = TItems<CSignatureItem>;

// The text of a span.
std::string_view TextOf(const CSourceFile& file, const CSpan& span);

}  // namespace codeloom
