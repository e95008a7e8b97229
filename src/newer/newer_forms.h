// What a line has that is newer than the version that it is written in, and what no version has any more.
//   in     the version, each node that is made, and what is read by hand
//   out    one SyntaxError which names the form, its place and the version that brought it
#pragma once

#include <cstdint>
#include <vector>

#include <nanobind/nanobind.h>

#include "neighbours/logicalline/logical_line.h"
#include "tree/node.h"

namespace codeloom {

struct CForm {
    static constexpr int kNone = INT32_MAX;

    const char* name;
    int version;  // the first that has it, 312 for 3.12; kNone for what ended with Python 2
};

namespace forms {

inline constexpr CForm kFString{"an f-string", 306};
inline constexpr CForm kVariableAnnotation{"an annotation of a variable", 306};
inline constexpr CForm kWalrus{"`:=`", 308};
inline constexpr CForm kStarInResult{"a starred expression without brackets behind `return` or `yield`", 308};
inline constexpr CForm kPositionalOnly{"`/` among parameters", 308};
inline constexpr CForm kDecorator{"a decorator that is no name or call of one", 309};
inline constexpr CForm kWithBrackets{"a `with` whose items stand in brackets", 309};
inline constexpr CForm kStarInFor{"a starred expression in the list of a `for`", 309};
inline constexpr CForm kWalrusInSet{"`:=` without brackets of its own in a set", 309};
inline constexpr CForm kMatch{"`match`", 310};
inline constexpr CForm kCase{"`case`", 310};
inline constexpr CForm kWalrusInSubscript{"`:=` without brackets of its own in a subscript", 310};
inline constexpr CForm kExceptStar{"`except*`", 311};
inline constexpr CForm kStarInSubscript{"a starred expression in a subscript", 311};
inline constexpr CForm kStarredAnnotation{"a starred annotation", 311};
inline constexpr CForm kTypeAlias{"`type`", 312};
inline constexpr CForm kTypeParameters{"a list of type parameters", 312};
inline constexpr CForm kTypeDefault{"a default of a type parameter", 313};
inline constexpr CForm kBareExcept{"an `except` of several types without brackets", 314};
inline constexpr CForm kTString{"a t-string", 314};

inline constexpr CForm kOldOctal{"an octal number without `0o`", CForm::kNone};
inline constexpr CForm kLongNumber{"the suffix `L` of a number", CForm::kNone};
inline constexpr CForm kRawUnicode{"the prefix `ur` of a string", CForm::kNone};

}  // namespace forms

class CNewerForms {
  public:
    // A form that a node of one grammar state shows: the child at fault, or -1.
    struct CNodeForm {
        const char* state;
        CForm form;
        Py_ssize_t (*find)(const CNode& node);
    };

    // Without a version of two integers at least, nothing is newer.
    void SetVersion(nb::handle version_triple);

    // `number_of_state` gives the number of a grammar state, or -1.
    template <class NumberOfState>
    void WatchStates(NumberOfState number_of_state);

    void Reset() { _fFound = nullptr; }
    void Note(const CForm& form, nb::handle context);

    // True for nodes that NoteNode is to look at.
    bool AreWatched(int type) const {
        return static_cast<size_t>(type) < _fWatched.size() && _fWatched[static_cast<size_t>(type)];
    }
    void NoteNode(int type, const CNode& node);

    bool HasFound() const { return _fFound != nullptr; }

    // The SyntaxError about the first form that was found.
    [[noreturn]] void Raise(CLogicalLine& logical) const;

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(_fContext);
    }

  private:
    static const std::vector<CNodeForm>& _NodeForms();
    void _Watch(int type, const CNodeForm* form);

    int _fVersion = INT32_MAX;
    std::vector<uint8_t> _fWatched;            // by node type, whether nodes of it are looked at
    std::vector<const CNodeForm*> _fNodeForm;  // by node type; none for strings
    const CForm* _fFound = nullptr;
    nb::object _fContext = nb::none();  // of what was found: a token's index, or its position
};

template <class NumberOfState>
void CNewerForms::WatchStates(NumberOfState number_of_state) {
    for (const CNodeForm& form : _NodeForms())
        if (form.form.version > _fVersion) _Watch(number_of_state(form.state), &form);
}

}  // namespace codeloom
