// Arguments as plain records, whatever shape the grammar gave them.
//   in     a parameter list or an argument list, or the lone parameter or argument that is in its place
//   out    one CArgument for each; the host sees a list of CArgInfo
// The records are native until the host looks: a call costs no host object.
#pragma once

#include <vector>

#include "tree/node.h"

namespace codeloom {

struct CArgument;
using CArgumentList = std::vector<CArgument>;

// What is known of one argument of a definition or of a call. The nodes belong to the tree, so a record is
// good only as long as that.
struct CArgument {
    CNodeRef name;       // of a parameter; in a call what is before `=`
    CNodeRef value;      // the default of a parameter; what a call passes
    CTextOrNone prefix;  // "*" or "**"
    CNodeRef type_expr;  // the annotation

    // A parameter of the old form that is a tuple of names in parentheses has nothing but these.
    bool is_tuple = false;
    CArgumentList tuple;

    bool is_foreign = false;  // stands for an item of a host's list that isn't an argument
};

// An argument as the host sees it. A tuple of parameters is a nested list there.
class CArgInfo : public CHosted, public CArgument {
  public:
    void Init() {}

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(name);
        visit(value);
        visit(prefix);
        visit(type_expr);
    }
};

// The parameters of a definition. `node` is a CParametersNode, a CDefiningArglistNode, or a lone parameter.
// AssertionError for a child that isn't a parameter.
CArgumentList GetDefiningArgInfoList(CNodeRef node);

// The arguments of a call. `node` is a CUsedArglistNode, a CTestListStarExpr, or a lone argument. The prefix
// of a lone argument isn't known.
CArgumentList GetUsedArgInfoList(CNodeRef node);

// Binds CArgInfo and the functions.
void BindArgumentInfo(nb::module_& module);

// One argument as the host sees it: a new CArgInfo, or a list for a tuple of parameters; an invalid handle,
// with a host exception pending, when it can't be made.
nb::handle NewHostArgument(const CArgument& argument) noexcept;

// A new list of the host; an invalid handle, with a host exception pending, when it can't be made.
nb::handle NewHostList(const CArgumentList& arguments) noexcept;

// False, with `arguments` in any state, when `candidate` isn't a list. Of its items CArgInfo and such lists
// are arguments, and any other is foreign.
bool ArgumentsFromHost(nb::handle candidate, CArgumentList& arguments) noexcept;

}  // namespace codeloom

namespace nanobind::detail {

template <>
struct type_caster<codeloom::CArgument> {
    NB_TYPE_CASTER(codeloom::CArgument, make_caster<codeloom::CArgInfo>::Name)

    bool from_python(handle source, uint32_t, cleanup_list*) noexcept {
        const codeloom::CArgInfo* const info = codeloom::TryInstance<codeloom::CArgInfo>(source);
        if (info != nullptr) value = *info;
        return info != nullptr;
    }

    static handle from_cpp(const codeloom::CArgument& source, rv_policy, cleanup_list*) noexcept {
        return codeloom::NewHostArgument(source);
    }
};

template <>
struct type_caster<codeloom::CArgumentList> {
    NB_TYPE_CASTER(codeloom::CArgumentList,
                   const_name("list[") + make_caster<codeloom::CArgInfo>::Name + const_name("]"))

    bool from_python(handle source, uint32_t, cleanup_list*) noexcept {
        return codeloom::ArgumentsFromHost(source, value);
    }

    static handle from_cpp(const codeloom::CArgumentList& source, rv_policy, cleanup_list*) noexcept {
        return codeloom::NewHostList(source);
    }
};

}  // namespace nanobind::detail
