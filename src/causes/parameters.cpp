// Parameters of functions and lambdas: order, `/`, `*`, defaults, parentheses.

#include <string_view>

#include "causes/recognisers.h"

namespace codeloom {

namespace {

// The tokens of a list of parameters, without what is around them.
struct CParameterList {
    int start = -1;
    int end = -1;
    bool is_lambda = false;

    explicit operator bool() const { return start >= 0; }
};

// def name [T] ( ... )
CParameterList ListOfDef(const CFaultyLine& line) {
    const int def_i = line.Is(0, EWord::kAsync) ? 1 : 0;
    if (!line.Is(def_i, EWord::kDef)) return {};
    int open_i = def_i + 2;
    if (line.Is(open_i, kTokenId_LSQB)) open_i = line.CloserOf(open_i) + 1;
    if (!line.Is(open_i, kTokenId_LPAR)) return {};
    return {open_i + 1, line.CloserOf(open_i), false};
}

// The tokens after the last `lambda` before the fault, up to the colon.
CParameterList ListOfLambda(const CFaultyLine& line) {
    const int opener_i = line.OpenerBefore(line.At());
    int lambda_i = line.FindBack(opener_i + 1, line.At(), EWord::kLambda);
    for (int outer_i = opener_i; lambda_i < 0 && outer_i >= 0; outer_i = line.OpenerBefore(outer_i))
        lambda_i = line.FindBack(line.OpenerBefore(outer_i) + 1, outer_i, EWord::kLambda);
    if (lambda_i < 0) return {};
    int depth = 0;
    for (int i = lambda_i + 1; i < line.Count(); ++i) {
        depth += IsOpenerType(line.Type(i)) - IsCloserType(line.Type(i));
        if (depth < 0 || (depth == 0 && line.Is(i, kTokenId_COLON))) return {lambda_i + 1, i, true};
    }
    return {lambda_i + 1, line.Count(), true};
}

// Reads a list from its start until something is wrong.
class CParameterReader {
  public:
    CParameterReader(const CFaultyLine& line, const CParameterList& list) : _fLine(line), _fList(list) {}

    CCause Read() {
        for (int start = _fList.start; start < _fList.end;) {
            const int end = _EndOf(start);
            if (CCause cause = _Take(start, end)) return cause;
            start = end + 1;
        }
        return _CheckBareStar(_fList.end);
    }

  private:
    int _EndOf(int start) const {
        int depth = 0;
        for (int i = start; i < _fList.end; ++i) {
            if (depth == 0 && _fLine.Is(i, kTokenId_COMMA)) return i;
            depth += IsOpenerType(_fLine.Type(i)) - IsCloserType(_fLine.Type(i));
        }
        return _fList.end;
    }

    CCause _Take(int start, int end) {
        if (start == end) return {};
        const int equal_i = _fLine.FindBack(start, end, kTokenId_EQUAL);
        if (_fHasTwoStars)
            return _Wrong(ECode::kParameterOrder, start, end, "arguments cannot follow var-keyword argument");
        switch (_fLine.Type(start)) {
            case kTokenId_LPAR:
                return _TakeParenthesis(start, end);
            case kTokenId_SLASH:
                return _TakeSlash(start, end);
            case kTokenId_STAR:
                return _TakeStar(start, end, equal_i);
            case kTokenId_DOUBLESTAR:
                if (CCause cause = _CheckBareStar(start)) return cause;
                _fHasTwoStars = true;
                if (equal_i < 0) return {};
                return _Wrong(ECode::kParameterOrder, equal_i, end,
                              "var-keyword argument cannot have default value");
            default:
                return _TakePlain(start, end, equal_i);
        }
    }

    CCause _TakeParenthesis(int start, int end) const {
        if (!_fLine.Language().IsPython3()) return {};
        CCause cause = _Wrong(ECode::kParenthesizedParameter, start, end,
                              _fList.is_lambda ? "Lambda expression parameters cannot be parenthesized"
                                               : "Function parameters cannot be parenthesized");
        cause->hint = "take one parameter and unpack it in the body; valid in Python 2";
        if (_fList.is_lambda && start == _fList.start && end == _fList.end)
            cause->hint = "leave the parentheses out";
        return cause;
    }

    CCause _TakeSlash(int start, int end) {
        if (_fHasSlash) return _Wrong(ECode::kMisplacedSlash, start, end, "/ may appear only once");
        if (_fHasStar) return _Wrong(ECode::kMisplacedSlash, start, end, "/ must be ahead of *");
        if (start == _fList.start)
            return _Wrong(ECode::kMisplacedSlash, start, end, "at least one argument must precede /");
        _fHasSlash = true;
        if (end == start + 1) return {};
        return _Wrong(ECode::kMisplacedSlash, start, start,
                      _fLine.Is(start + 1, kTokenId_STAR) ? "expected comma between / and *"
                                                          : "expected ',' after '/'");
    }

    CCause _TakeStar(int start, int end, int equal_i) {
        if (_fHasStar) return _Wrong(ECode::kParameterOrder, start, end, "* argument may appear only once");
        _fHasStar = true;
        if (equal_i >= 0)
            return _Wrong(ECode::kParameterOrder, equal_i, end,
                          "var-positional argument cannot have default value");
        if (end == start + 1) _fBareStar = start;
        return {};
    }

    CCause _TakePlain(int start, int end, int equal_i) {
        _fBareStar = -1;
        if (equal_i >= 0 && equal_i + 1 == end)
            return _Wrong(ECode::kMissingDefault, start, end, "expected default value expression");
        if (equal_i < 0 && _fDefault >= 0 && !_fHasStar && _fLine.IsName(start)) {
            CCause cause = _Wrong(ECode::kParameterOrder, start, end,
                                  _fLine.Language().version >= 312
                                      ? "parameter without a default follows parameter with a default"
                                      : "non-default argument follows default argument");
            cause->related.push_back(_fLine.Related(_fDefault, "the parameter with a default"));
            return cause;
        }
        if (equal_i >= 0 && _fDefault < 0) _fDefault = start;
        return {};
    }

    // `*` alone wants a parameter after it.
    CCause _CheckBareStar(int end) const {
        const bool has_end = end < _fLine.Count();
        if (_fBareStar < 0 || !has_end) return {};
        return _Wrong(ECode::kParameterOrder, _fBareStar, _fBareStar, "named arguments must follow bare *");
    }

    CCause _Wrong(ECode code, int start, int end, std::string_view message) const {
        return _fLine.Problem(code, start, end > start ? end - 1 : start, std::string(message));
    }

    const CFaultyLine& _fLine;
    const CParameterList _fList;
    bool _fHasSlash = false;
    bool _fHasStar = false;
    bool _fHasTwoStars = false;
    int _fBareStar = -1;
    int _fDefault = -1;  // the first parameter with one
};

}  // namespace

CCause ParameterFault(const CFaultyLine& line) {
    const auto is_in = [&](const CParameterList& list) {
        return list && line.At() >= list.start && line.At() <= list.end;
    };
    for (const CParameterList& list : {ListOfLambda(line), ListOfDef(line)})
        if (is_in(list))
            if (CCause cause = CParameterReader(line, list).Read()) return cause;
    const int i = line.At();
    const CParameterList list = ListOfDef(line);
    if (is_in(list) && line.Is(i, kTokenId_DOT) && line.OpenerBefore(i) == list.start - 1 &&
        line.ItemStart(i) == i - 1)
        return line.Problem(ECode::kMissingName, i - 1, i + 1, "a parameter is a plain name",
                            "assign to an attribute in the body");
    return {};
}

}  // namespace codeloom
