#include "syntax/language.h"

#include <cassert>
#include <memory>
#include <mutex>

#include "syntax/grammar_texts.h"
#include "syntax/syntax_grammar.h"

namespace codeloom {

namespace {

constexpr int kPython2 = 207;
constexpr int kOldestPython3 = 300;
constexpr int kVersionCount = CLanguage::kNewest + 1;

constexpr auto kKeywords = std::to_array<EWord>(
    {EWord::kAnd,    EWord::kAs,     EWord::kAssert, EWord::kBreak, EWord::kClass,  EWord::kContinue,
     EWord::kDef,    EWord::kDel,    EWord::kElif,   EWord::kElse,  EWord::kExcept, EWord::kFinally,
     EWord::kFor,    EWord::kFrom,   EWord::kGlobal, EWord::kIf,    EWord::kImport, EWord::kIn,
     EWord::kIs,     EWord::kLambda, EWord::kNot,    EWord::kOr,    EWord::kPass,   EWord::kRaise,
     EWord::kReturn, EWord::kTry,    EWord::kWhile,  EWord::kWith,  EWord::kYield});
constexpr auto kPython3Keywords =
    std::to_array<EWord>({EWord::kFalse, EWord::kNoneValue, EWord::kTrue, EWord::kNonlocal});

const CSyntaxGrammar& Grammar27() {
    static const CSyntaxGrammar grammar("Python-Grammar-2.7", grammar_texts::k27);
    return grammar;
}
const CSyntaxGrammar& Grammar27PrintFunction() {
    static const CSyntaxGrammar grammar("Python-Grammar-2.7-print-function", grammar_texts::k27PrintFunction);
    return grammar;
}
const CSyntaxGrammar& Grammar38() {
    static const CSyntaxGrammar grammar("Python-Grammar-3.8", grammar_texts::k38);
    return grammar;
}
const CSyntaxGrammar& Grammar314() {
    static const CSyntaxGrammar grammar("Python-Grammar-3.14", grammar_texts::k314);
    return grammar;
}

// Begin statements that are read by hand, or that invented tokens complete.
constexpr auto kUnusualWords = std::to_array<EWord>(
    {EWord::kWith, EWord::kMatch, EWord::kCase, EWord::kExcept, EWord::kType, EWord::kDef, EWord::kClass,
     EWord::kAsync, EWord::kElif, EWord::kElse, EWord::kTry, EWord::kFinally});

CLeafClass ClassOf(int label, int symbol, ENodeKind kind, EWord word = EWord::kNone) {
    assert(label < CLeafClass::kFirstSpecial);
    return {static_cast<uint16_t>(symbol), kind, word, static_cast<uint8_t>(label)};
}

ENodeKind KindOfType(int type, bool has_newer_statements) {
    switch (type) {
        case kTokenId_NAME:
            return ENodeKind::kNameLiteral;
        case kTokenId_NUMBER:
            return ENodeKind::kNumberLiteral;
        case kTokenId_STRING:
            return ENodeKind::kStringLiteral;
        case kTokenId_ELLIPSIS:
            return has_newer_statements ? ENodeKind::kExpression : ENodeKind::kNode;
        default:
            return ENodeKind::kNode;
    }
}

void ClassifyTypes(const CLanguage& language, bool has_ellipsis, CLeafClasses& classes) {
    for (int type = 0; type <= kTokenId_BACKSLASH; ++type)
        classes.OfType(type) = ClassOf(language.grammar->LabelOfType(type), type,
                                       KindOfType(type, language.has_newer_statements));
    classes.OfType(kTokenId_STRING).traits = CLeafClass::kLiteral;
    classes.OfType(kTokenId_NUMBER).traits = CLeafClass::kLiteral;
    classes.OfType(kTokenId_AT).traits = CLeafClass::kBeginsUnusual;
    classes.OfType(kTokenId_COMMENT).label = CLeafClass::kComment;
    classes.OfType(kTokenId_BACKSLASH).label = CLeafClass::kBackslash;
    if (!has_ellipsis) classes.OfType(kTokenId_ELLIPSIS).label = CLeafClass::kThreeDots;
}

void ClassifyWords(const CLanguage& language, CLeafClasses& classes) {
    for (size_t word_i = 1; word_i < static_cast<size_t>(EWord::kCount); ++word_i) {
        const EWord word = static_cast<EWord>(word_i);
        const int type = GetTokenType(TextOfWord(word));
        classes.OfWord(word) = ClassOf(language.grammar->LabelOfWord(word, type), type,
                                       KindOfType(type, language.has_newer_statements), word);
    }
    for (const EWord word : kUnusualWords) classes.OfWord(word).traits = CLeafClass::kBeginsUnusual;
}

// Requires: the version of the forms is set.
void ClassifyChains(CLanguage& language) {
    const CSyntaxGrammar& grammar = *language.grammar;
    language.chain_classes.resize(1);
    for (int chain = 1; chain < grammar.Tables().ChainCount(); ++chain) {
        const int rule_number = grammar.Tables().RuleNumber(chain);
        const CRuleForm* const form = grammar.FormOfRule(rule_number);
        language.chain_classes.push_back(
            {.row_around = grammar.Tables().RowAround(chain),
             .rule_number = static_cast<uint16_t>(rule_number),
             .kind = grammar.KindOfRule(rule_number),
             .may_be_refused = form != nullptr && form->form->version > language.forms_version,
             .is_line = grammar.NameOfRule(rule_number) == "simple_stmt"});
    }
}

template <class Words>
void AddKeywords(const Words& words, CLanguage& language) {
    for (CLeafClasses& classes : language.leaf_classes)
        for (const EWord word : words) classes.OfWord(word).kind = ENodeKind::kKeywordLiteral;
}

// `async` and `await` where they are keywords have token types of their own, though not in the tree.
void MakeAsyncTokens(const CSyntaxGrammar& grammar, CLeafClasses& classes) {
    const auto make = [&](EWord word, int type) {
        CLeafClass& leaf_class = classes.OfWord(word);
        leaf_class.kind = ENodeKind::kKeywordLiteral;
        leaf_class.label = static_cast<uint8_t>(grammar.LabelOfType(type));
    };
    make(EWord::kAsync, kTokenId_ASYNC);
    make(EWord::kAwait, kTokenId_AWAIT);
}

// Without its keywords.
std::unique_ptr<CLanguage> NewLanguage(int version, int forms_version, const CSyntaxGrammar& grammar,
                                       bool is_grammar_of_python3) {
    auto language = std::make_unique<CLanguage>();
    language->version = version;
    language->forms_version = forms_version;
    language->has_newer_statements = version >= kOldestPython3;
    language->grammar = &grammar;
    for (CLeafClasses& classes : language->leaf_classes) {
        ClassifyTypes(*language, is_grammar_of_python3, classes);
        ClassifyWords(*language, classes);
    }
    ClassifyChains(*language);
    AddKeywords(kKeywords, *language);
    if (is_grammar_of_python3) AddKeywords(kPython3Keywords, *language);
    return language;
}

std::unique_ptr<CLanguage> NewPython2(bool has_print_function) {
    auto language = NewLanguage(kPython2, CLanguage::kAllForms,
                                has_print_function ? Grammar27PrintFunction() : Grammar27(), false);
    AddKeywords(std::array{EWord::kExec}, *language);
    if (!has_print_function) AddKeywords(std::array{EWord::kPrint}, *language);
    MakeAsyncTokens(*language->grammar, language->leaf_classes[1]);
    return language;
}

std::unique_ptr<CLanguage> NewPython3(int version) {
    auto language = NewLanguage(version, version, version >= 309 ? Grammar314() : Grammar38(), true);
    if (language->HasAsyncKeywords()) AddKeywords(std::array{EWord::kAsync, EWord::kAwait}, *language);
    MakeAsyncTokens(*language->grammar, language->leaf_classes[1]);
    return language;
}

std::unique_ptr<CLanguage> NewHintLanguage(int version) {
    auto language = NewLanguage(version, CLanguage::kAllForms,
                                version >= kOldestPython3 ? Grammar314() : Grammar38(), true);
    AddKeywords(std::array{EWord::kAsync, EWord::kAwait}, *language);
    MakeAsyncTokens(*language->grammar, language->leaf_classes[1]);
    return language;
}

// One object for each version, made once.
class CLanguages {
  public:
    template <class Make>
    const CLanguage& Get(int version, Make make) {
        assert(IsKnownVersion(version));
        const std::lock_guard lock(_fMutex);
        std::unique_ptr<CLanguage>& language = _fLanguages[static_cast<size_t>(version)];
        if (!language) language = make(version);
        return *language;
    }

  private:
    std::mutex _fMutex;
    std::array<std::unique_ptr<CLanguage>, kVersionCount> _fLanguages;
};

}  // namespace

bool IsKnownVersion(int version) {
    return version == kPython2 || (version >= kOldestPython3 && version <= CLanguage::kNewest);
}

const CLanguage& LanguageOf(int version, bool has_print_function) {
    static CLanguages languages;
    static CLanguages print_function_languages;
    CLanguages& group = version == kPython2 && has_print_function ? print_function_languages : languages;
    return group.Get(version, [&](int wanted) {
        return wanted == kPython2 ? NewPython2(has_print_function) : NewPython3(wanted);
    });
}

const CLanguage& HintLanguageOf(int version) {
    static CLanguages languages;
    return languages.Get(version, NewHintLanguage);
}

}  // namespace codeloom
