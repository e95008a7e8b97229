#include "tree/argument_info.h"

#include "tree/argument_nodes.h"
#include "tree/atom_nodes.h"
#include "tree/child_list.h"
#include "tree/token_end.h"

namespace codeloom {

namespace {

// The node as a Class, borrowed; null when it is of another class, or none.
template <class Class>
Class* As(const CNodeRef& node) {
    return node ? node->As<Class>() : nullptr;
}

template <class Class>
bool IsA(const CNodeRef& node) {
    return As<Class>(node) != nullptr;
}

CArgument TupleParameter(CNodeRef nested) {
    CArgument parameter;
    parameter.is_tuple = true;
    parameter.tuple = GetDefiningArgInfoList(std::move(nested));
    return parameter;
}

CArgument LoneParameter(const CNodeRef& node) {
    CArgument parameter;
    if (CFunctionParameterDef* const definition = As<CFunctionParameterDef>(node)) {
        CNodeRef nested = definition->GetNestedListNode();
        if (nested) return TupleParameter(std::move(nested));
        parameter.name = definition->GetName();
        parameter.type_expr = definition->GetTypeExpr();
        return parameter;
    }
    HostAssert(IsA<CNameLiteral>(node), [&] { return nb::make_tuple(node, node->fText); });
    parameter.name = node;
    return parameter;
}

// Reads a parameter list, child by child.
class CParameterReader {
  public:
    CArgumentList Read(const CNode& list_node) {
        for (Py_ssize_t i = 0; i < ListedCount(list_node); ++i) _ReadChild(list_node.ChildAs<CNode>(i));
        _EndParameter();
        return std::move(_fParameters);
    }

  private:
    void _ReadChild(const CNodeRef& child) {
        if (IsA<CFunctionParameterDef>(child)) return _ReadDefinition(child);
        const nb::object text = child->fText;
        if (TextIs(text, ",")) {
            _EndParameter();
        } else if (TextIsOneOf(text, "*", "**")) {
            _fCurrent.prefix = text;
        } else if (TextIs(text, "=")) {
            _fAfterEqual = true;
        } else if (TextIs(text, ":")) {
            _fAfterColon = true;
        } else if (!TextIs(text, "/")) {
            _ReadPart(child);
        }
    }

    void _ReadDefinition(const CNodeRef& child) {
        CArgument parameter = LoneParameter(child);
        if (parameter.is_tuple) {
            _fParameters.push_back(std::move(parameter));
        } else {
            _fCurrent.name = std::move(parameter.name);
            _fCurrent.type_expr = std::move(parameter.type_expr);
        }
    }

    // A default, an annotation or the name, by what is before it.
    void _ReadPart(const CNodeRef& child) {
        if (_fAfterEqual) {
            _fCurrent.value = child;
        } else if (_fAfterColon) {
            _fCurrent.type_expr = child;
        } else if (IsA<CNameLiteral>(child)) {
            _fCurrent.name = child;
        } else {
            HostAssert(TextIsOneOf(child->fText, "(", ")"), [&] {
                return nb::str("Text is not ( or ): text = {}, type(child) = {}")
                    .format(nb::repr(child->fText), nb::repr(child->Self().type()));
            });
        }
    }

    void _EndParameter() {
        if (_fCurrent.name || !_fCurrent.prefix.is_none()) _fParameters.push_back(std::move(_fCurrent));
        _fCurrent = CArgument();
        _fAfterEqual = _fAfterColon = false;
    }

    CArgumentList _fParameters;
    CArgument _fCurrent;
    bool _fAfterEqual = false;
    bool _fAfterColon = false;
};

CArgument LoneArgument(const CNodeRef& node) {
    CArgument argument;
    if (CSingleUsedArgumentNode* const single = As<CSingleUsedArgumentNode>(node)) {
        argument.name = single->GetName();
        argument.value = single->GetValue();
    } else {
        argument.value = node;
    }
    return argument;
}

nb::object HostArgument(const CArgument& argument) {
    if (argument.is_tuple) return nb::cast(argument.tuple);
    CRef<CArgInfo> info = MakeInstance<CArgInfo>();
    static_cast<CArgument&>(*info) = argument;
    return info.Release();
}

// What `make` gives, for a caster: an invalid handle, with the exception pending, when it fails.
template <class Make>
nb::handle Released(Make make) noexcept {
    try {
        return make().release();
    } catch (nb::python_error& error) {
        error.restore();
        return nb::handle();
    }
}

bool ArgumentFromHost(nb::handle candidate, CArgument& argument) {
    if (nb::isinstance<nb::list>(candidate)) {
        argument.is_tuple = true;
        return ArgumentsFromHost(candidate, argument.tuple);
    }
    const CArgInfo* const info = TryInstance<CArgInfo>(candidate);
    if (info != nullptr) {
        argument = *info;
    } else {
        argument.is_foreign = true;
    }
    return true;
}

}  // namespace

CArgumentList GetDefiningArgInfoList(CNodeRef node) {
    const CRecursionScope recursion;
    if (IsA<CParametersNode>(node)) {
        if (node->ChildCount() == 2) return CArgumentList();
        node = node->ChildAs<CNode>(1);
    }
    if (IsA<CDefiningArglistNode>(node)) return CParameterReader().Read(*node);
    return CArgumentList{LoneParameter(node)};
}

CArgumentList GetUsedArgInfoList(CNodeRef node) {
    if (!IsA<CUsedArglistNode>(node) && !IsA<CTestListStarExpr>(node))
        return CArgumentList{LoneArgument(node)};
    CArgumentList arguments;
    CArgument current;
    for (Py_ssize_t i = 0; i < ListedCount(*node); ++i) {
        const CNodeRef child = node->ChildAs<CNode>(i);
        if (child->HasText(",")) {
            arguments.push_back(std::exchange(current, CArgument()));
        } else if (TextIsOneOf(child->fText, "*", "**")) {
            current.prefix = child->fText;
        } else if (CSingleUsedArgumentNode* const single = As<CSingleUsedArgumentNode>(child)) {
            current.prefix = single->GetPrefix();
            current.name = single->GetName();
            current.value = single->GetValue();
        } else {
            current.value = child;
        }
    }
    if (current.value) arguments.push_back(std::move(current));
    return arguments;
}

nb::handle NewHostArgument(const CArgument& argument) noexcept {
    return Released([&] { return HostArgument(argument); });
}

nb::handle NewHostList(const CArgumentList& arguments) noexcept {
    return Released([&]() -> nb::object {
        nb::list result;
        for (const CArgument& argument : arguments) result.append(HostArgument(argument));
        return result;
    });
}

bool ArgumentsFromHost(nb::handle candidate, CArgumentList& arguments) noexcept {
    arguments.clear();
    if (!nb::isinstance<nb::list>(candidate)) return false;
    try {
        const CRecursionScope recursion;  // a list may contain itself
        for (Py_ssize_t i = 0; i < ListSize(candidate); ++i) {
            arguments.emplace_back();
            if (!ArgumentFromHost(ListItem(candidate, i), arguments.back())) return false;
        }
        return true;
    } catch (nb::python_error&) {
        return false;
    }
}

void BindArgumentInfo(nb::module_& module) {
    nb::class_<CArgInfo>(
        module, "CArgInfo", Collected<CArgInfo>(),
        "What is known of one argument of a definition or of a call. Good only as long as the "
        "tree that its nodes belong to.")
        .def(TInit<>())
        .def_ro("name", &CArgInfo::name,
                "The node of the name: of a parameter, or before `=` in a call; None without one.")
        .def_ro("value", &CArgInfo::value,
                "The node of a parameter's default or of what a call passes; None without one.")
        .def_ro("prefix", &CArgInfo::prefix, "\"*\" or \"**\"; None without such.")
        .def_ro("type_expr", &CArgInfo::type_expr, "The node of the annotation; None without one.");
    module.def(
        "GetTokenEndIndex", &GetTokenEndIndex, "node"_a,
        "The index of the token after the node's last one; TypeError when that isn't known by an index.");
    module.def(
        "GetDefiningArgInfoList", &GetDefiningArgInfoList, "node"_a.none(),
        "A new list of CArgInfo, one for each parameter of a definition: `node` is its parameter list, with "
        "or without brackets, or a lone parameter. A parameter that is a tuple of names (Python 2) is a list "
        "of the same kind. AssertionError for a child that isn't a parameter.");
    module.def(
        "GetUsedArgInfoList", &GetUsedArgInfoList, "node"_a.none(),
        "A new list of CArgInfo, one for each argument of a call: `node` is its argument list, or a lone "
        "argument, whose prefix isn't known.");
}

}  // namespace codeloom
