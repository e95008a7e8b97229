#include "face/signature_items.h"

namespace codeloom {

namespace {

nb::object HintOrNone(const CSourceFilePtr& file, uint32_t hint_i) {
    return hint_i == UINT32_MAX ? nb::none() : NewObject<CHintItem>(file, hint_i);
}

}  // namespace

std::string_view TextOf(const CSourceFile& file, const CSpan& span) {
    return file.Text().substr(span.start, span.end - span.start);
}

bool CHintItem::operator==(const CHintItem& other) const {
    return Data().kind == other.Data().kind && Range() == other.Range() && Target() == other.Target() &&
           TextOf(*file, Data().hint) == TextOf(*other.file, other.Data().hint);
}

nb::object CParameterItem::Default() const {
    const CSpan& span = Data().default_value;
    if (span.start == span.end) return nb::none();
    return NewObject<CRange>(RangeOfBytes(*file, span.start, span.end));
}

nb::object CParameterItem::Hint() const {
    return HintOrNone(file, Data().hint);
}

bool CParameterItem::operator==(const CParameterItem& other) const {
    return Data().kind == other.Data().kind && Range() == other.Range() &&
           TextOf(*file, Data().name) == TextOf(*other.file, other.Data().name);
}

nb::object CSignatureItem::Parameters() const {
    nb::list parameters;
    const CSignatures& all = file->Signatures();
    for (uint32_t parameter_i = all.FirstParameter(i); parameter_i < all.FirstParameter(i + 1); ++parameter_i)
        parameters.append(NewObject<CParameterItem>(file, parameter_i));
    return nb::tuple(parameters);
}

nb::object CSignatureItem::ReturnHint() const {
    return HintOrNone(file, Data().return_hint);
}

bool CSignatureItem::operator==(const CSignatureItem& other) const {
    return Line() == other.Line() && Range() == other.Range();
}

}  // namespace codeloom
