#include "arrow/signature_rows.h"

namespace codeloom {

namespace {

std::string_view TextOf(const CTextFacts& text, const CSpan& span) {
    return text.text.substr(span.start, span.end - span.start);
}

CRange RangeOf(const CTextFacts& text, const CSpan& span) {
    return text.rows.RangeOf(span.start, span.end);
}

std::optional<std::string_view> HintText(const CTextFacts& text, uint32_t hint_i) {
    if (hint_i == UINT32_MAX) return std::nullopt;
    return TextOf(text, text.analysis.signatures.hints[hint_i].hint);
}

}  // namespace

// Signatures

const TColumns<CSignatureRow>& CSignatureSource::Columns() {
    static const auto columns =
        TColumns<CSignatureRow>()
            .Add<&CSignatureRow::signature>("signature", "Its index, by which other tables name it.")
            .Add<&CSignatureRow::line>("line", "The index of the header's line.")
            .Add<&CSignatureRow::name>("name", "The function's name.")
            .AddRange<&CSignatureRow::range>("", "The row of the name, from 1.")
            .Add<&CSignatureRow::is_async>("is_async", "It is an `async def`.")
            .Add<&CSignatureRow::is_method>("is_method", "It is right in the body of a class.")
            .Add<&CSignatureRow::parameters>("parameters", "How many parameters it has.")
            .Add<&CSignatureRow::return_hint>("return_hint",
                                              "The hint of what it returns; null without "
                                              "one.");
    return columns;
}

CSignatureRow CSignatureSource::Of(uint32_t i) const {
    const CSignatures& all = _fText.analysis.signatures;
    const CSignature& signature = all.items[i];
    return {.signature = i,
            .line = signature.line,
            .name = {TextOf(_fText, signature.name)},
            .range = RangeOf(_fText, signature.name),
            .is_async = signature.is_async,
            .is_method = signature.is_method,
            .parameters = all.FirstParameter(i + 1) - signature.first_parameter,
            .return_hint = HintText(_fText, signature.return_hint)};
}

// Parameters

const TColumns<CParameterRow>& CParameterSource::Columns() {
    static const auto columns =
        TColumns<CParameterRow>()
            .Add<&CParameterRow::signature>("signature", "The index of its signature.")
            .Add<&CParameterRow::position>("position", "Its place among the parameters, from zero.")
            .Add<&CParameterRow::name>("name", "Its name.")
            .Add<&CParameterRow::kind>("kind", "How arguments reach it, in the words of `inspect`.")
            .AddRange<&CParameterRow::range>("", "The row of the name, from 1.")
            .Add<&CParameterRow::default_value>("default", "Its default, as written; null without one.")
            .Add<&CParameterRow::hint>("hint",
                                       "Its annotation, else its hint in a comment; null without "
                                       "any.");
    return columns;
}

CParameterRow CParameterSource::Of(uint32_t i) {
    const CSignatures& all = _fText.analysis.signatures;
    while (i < all.FirstParameter(_fSignature)) --_fSignature;
    while (i >= all.FirstParameter(_fSignature + 1)) ++_fSignature;
    const CSignatureParameter& parameter = all.parameters[i];
    const CSpan& value = parameter.default_value;
    return {.signature = _fSignature,
            .position = i - all.FirstParameter(_fSignature),
            .name = {TextOf(_fText, parameter.name)},
            .kind = parameter.kind,
            .range = RangeOf(_fText, parameter.name),
            .default_value = value.start == value.end ? std::nullopt : std::optional(TextOf(_fText, value)),
            .hint = HintText(_fText, parameter.hint)};
}

// Hints

const TColumns<CHintRow>& CHintSource::Columns() {
    static const auto columns =
        TColumns<CHintRow>()
            .Add<&CHintRow::line>("line", "The index of its line.")
            .Add<&CHintRow::kind>("kind", "What it is about.")
            .Add<&CHintRow::name>("name",
                                  "The name or chain that it is about; of what a function gives "
                                  "back, that of the function.")
            .Add<&CHintRow::text>("text", "The hint as written, quotes included.")
            .AddRange<&CHintRow::range>("", "Its row, from 1.")
            .Add<&CHintRow::in_comment>("in_comment", "It is in a comment.");
    return columns;
}

CHintRow CHintSource::Of(uint32_t i) const {
    const CHintInfo& hint = _fText.analysis.signatures.hints[i];
    return {.line = hint.line,
            .kind = hint.kind,
            .name = {TextOf(_fText, hint.target)},
            .text = TextOf(_fText, hint.hint),
            .range = RangeOf(_fText, hint.hint),
            .in_comment = hint.in_comment};
}

}  // namespace codeloom
