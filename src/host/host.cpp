#include <algorithm>
#include <string>

#include <cxxabi.h>
#ifdef __linux__
#include <pthread.h>
#endif

#include "host/collections.h"
#include "host/errors.h"
#include "host/hosted.h"
#include "host/neighbour_call.h"
#include "host/overrides.h"
#include "host/text.h"

namespace codeloom {

namespace {

// Borrowed; null without an exception when the type has no such attribute.
PyObject* TypeAttribute(nb::handle type, PyObject* name) {
    return _PyType_Lookup(reinterpret_cast<PyTypeObject*>(type.ptr()), name);
}

// The host's class for an exception that nanobind raises natively.
nb::handle HostClass(const nb::builtin_exception& error) {
    switch (error.type()) {
        case nb::exception_type::index_error:
            return PyExc_IndexError;
        case nb::exception_type::key_error:
            return PyExc_KeyError;
        case nb::exception_type::value_error:
            return PyExc_ValueError;
        case nb::exception_type::type_error:
            return PyExc_TypeError;
        case nb::exception_type::attribute_error:
            return PyExc_AttributeError;
        default:
            return PyExc_RuntimeError;
    }
}

}  // namespace

std::string HostName(const std::type_info& type) {
    char* const demangled = abi::__cxa_demangle(type.name(), nullptr, nullptr, nullptr);
    std::string name = demangled == nullptr ? type.name() : demangled;
    std::free(demangled);
    if (const size_t start = name.rfind("::"); start != std::string::npos) name.erase(0, start + 2);
    if (name.ends_with('>')) name.pop_back();
    return name;
}

void RaiseWrongType(const char* expected, nb::handle found) {
    PyErr_Format(PyExc_TypeError, "expected %s, %s found", expected, Py_TYPE(found.ptr())->tp_name);
    throw nb::python_error();
}

void RaiseForeignInit(const std::type_info& called, const std::type_info& wanted, nb::handle self) {
    PyErr_Format(PyExc_TypeError, "%s.__init__ can't make a %s: call %s.__init__", HostName(called).c_str(),
                 Py_TYPE(self.ptr())->tp_name, HostName(wanted).c_str());
    throw nb::python_error();
}

void RaiseNoneUsed(const std::type_info& wanted) {
    PyErr_Format(PyExc_AttributeError, "expected %s, NoneType found", HostName(wanted).c_str());
    throw nb::python_error();
}

// errors.h

bool HostAssertionsOn() {
    static const bool on = nb::cast<int>(nb::module_::import_("sys").attr("flags").attr("optimize")) == 0;
    return on;
}

bool HostAssertHolds(bool condition) {
    if (condition || !HostAssertionsOn()) return true;
    PyErr_SetNone(PyExc_AssertionError);
    return false;
}

void HostAssert(bool condition) {
    if (!HostAssertHolds(condition)) throw nb::python_error();
}

void PrintReport(nb::handle line) {
    nb::module_::import_("builtins").attr("print")(line);
}

void RaiseHost(nb::handle type, const char* message) {
    PyErr_SetString(type.ptr(), message);
    throw nb::python_error();
}

// As `raise type(value)`: the host takes a tuple for several arguments otherwise.
void RaiseHost(nb::handle type, nb::handle value) {
    RaiseHostError(nb::borrow(type)(value));
}

void RaiseHostError(nb::handle error) {
    if (!PyExceptionInstance_Check(error.ptr())) RaiseWrongType("an exception", error);
    PyErr_SetObject(error.type().ptr(), error.ptr());
    throw nb::python_error();
}

namespace {

// Where the stack of this thread is as good as used up: what lies beyond is for the host's own calls. Null
// when the platform doesn't say.
const char* LowestStackAddress() {
#ifdef __linux__
    constexpr size_t kReserve = 128 * 1024;
    pthread_attr_t attributes;
    if (pthread_getattr_np(pthread_self(), &attributes) != 0) return nullptr;
    void* lowest = nullptr;
    size_t size = 0;
    pthread_attr_getstack(&attributes, &lowest, &size);
    pthread_attr_destroy(&attributes);
    return static_cast<const char*>(lowest) + std::min(size / 4, kReserve);
#else
    return nullptr;
#endif
}

}  // namespace

CRecursionScope::CRecursionScope() {
    static thread_local const char* const lowest = LowestStackAddress();
    if (static_cast<const char*>(__builtin_frame_address(0)) < lowest)
        RaiseHost(PyExc_RecursionError,
                  "the thread's stack is too small to go deeper: make it larger with threading.stack_size()");
    if (Py_EnterRecursiveCall(" in codeloom") != 0) throw nb::python_error();
}

CRecursionScope::~CRecursionScope() {
    Py_LeaveRecursiveCall();
}

CHostError CHostError::Current() {
    try {
        throw;
    } catch (nb::python_error& error) {
        if (error.traceback().is_valid())
            PyException_SetTraceback(error.value().ptr(), error.traceback().ptr());
        return CHostError(nb::borrow<nb::object>(error.value()));
    } catch (const nb::builtin_exception& error) {
        return CHostError(nb::borrow<nb::object>(HostClass(error))(error.what()));
    } catch (const std::bad_alloc&) {
        return CHostError(nb::borrow<nb::object>(PyExc_MemoryError)());
    } catch (const std::exception& error) {
        return CHostError(nb::borrow<nb::object>(PyExc_RuntimeError)(error.what()));
    }
}

bool CHostError::Is(nb::handle type) const {
    return PyErr_GivenExceptionMatches(_fValue.ptr(), type.ptr()) != 0;
}

void CHostError::Raise() const {
    RaiseHostError(_fValue);
}

CHandlingScope::CHandlingScope(const CHostError& error)
    : _fPrevious(nb::steal<nb::object>(PyErr_GetHandledException())) {
    PyErr_SetHandledException(error.Value().ptr());
}

CHandlingScope::~CHandlingScope() {
    PyErr_SetHandledException(_fPrevious.ptr());
}

// overrides.h

CHostOperation::CHostOperation(const char* name) : _fName(PyUnicode_InternFromString(name)) {}

bool CHostOperation::IsOverridden(nb::handle self, nb::handle native_type) const {
    return TypeAttribute(self.type(), _fName) != TypeAttribute(native_type, _fName);
}

nb::object CHostOperation::Call(PyObject* const* stack, size_t count) const {
    PyObject* const result = PyObject_VectorcallMethod(_fName, stack, count + 1, nullptr);
    if (result == nullptr) throw nb::python_error();
    return nb::steal<nb::object>(result);
}

void CHostOperation::RaiseWrongResult(nb::handle self, const std::string& wanted, nb::handle result) const {
    PyErr_Format(PyExc_TypeError, "%s.%U must return %s, not %s", Py_TYPE(self.ptr())->tp_name, _fName,
                 wanted.c_str(), Py_TYPE(result.ptr())->tp_name);
    throw nb::python_error();
}

// collections.h

void RaiseIndexError(const char* message) {
    throw nb::index_error(message);
}

nb::object ListOrNone(nb::handle candidate) {
    if (!candidate.is_none() && !PyList_Check(candidate.ptr())) RaiseWrongType("list", candidate);
    return nb::borrow<nb::object>(candidate);
}

void DeleteListItem(nb::handle list, Py_ssize_t i) {
    if (PySequence_DelItem(list.ptr(), i) != 0) throw nb::python_error();
}

bool IsSubclass(nb::handle candidate, nb::handle base) {
    return PyType_IsSubtype(reinterpret_cast<PyTypeObject*>(candidate.ptr()),
                            reinterpret_cast<PyTypeObject*>(base.ptr())) != 0;
}

nb::object FindInDict(nb::handle dict_or_none, nb::handle key) {
    if (dict_or_none.is_none()) return nb::object();
    PyObject* const value = PyDict_GetItemWithError(dict_or_none.ptr(), key.ptr());
    if (value == nullptr && PyErr_Occurred() != nullptr) throw nb::python_error();
    return nb::borrow(value);
}

// text.h

nb::object TextFromUtf8(std::string_view utf8) {
    PyObject* const text =
        PyUnicode_DecodeUTF8(utf8.data(), static_cast<Py_ssize_t>(utf8.size()), "surrogatepass");
    if (text == nullptr) throw nb::python_error();
    return nb::steal<nb::object>(text);
}

nb::object InternedText(std::string_view utf8) {
    PyObject* text = TextFromUtf8(utf8).release().ptr();
    PyUnicode_InternInPlace(&text);
    return nb::steal<nb::object>(text);
}

namespace {

std::string_view BytesView(nb::handle bytes) {
    return {PyBytes_AS_STRING(bytes.ptr()), static_cast<size_t>(PyBytes_GET_SIZE(bytes.ptr()))};
}

nb::object BytesWithSurrogates(nb::handle text) {
    if (!PyErr_ExceptionMatches(PyExc_UnicodeEncodeError)) throw nb::python_error();
    PyErr_Clear();
    PyObject* const bytes = PyUnicode_AsEncodedString(text.ptr(), "utf-8", "surrogatepass");
    if (bytes == nullptr) throw nb::python_error();
    return nb::steal<nb::object>(bytes);
}

}  // namespace

void CUtf8::_SetView(nb::handle text) {
    if (!PyUnicode_Check(text.ptr())) RaiseWrongType("str or bytes", text);
    Py_ssize_t size = 0;
    if (const char* const utf8 = PyUnicode_AsUTF8AndSize(text.ptr(), &size)) {
        _fView = {utf8, static_cast<size_t>(size)};
        return;
    }
    _fMade = BytesWithSurrogates(text);
    _fView = BytesView(_fMade);
}

// neighbour_call.h

namespace {
PyObject* gHomeModule = nullptr;  // the home module is never unloaded
}

void SetHomeModule(nb::module_ module) {
    gHomeModule = module.release().ptr();
}

nb::module_ HomeModule() {
    return nb::borrow<nb::module_>(gHomeModule);
}

nb::object CNeighbourFunction::Find() const {
    return HomeModule().attr(_fModuleName).attr(_fFunctionName);
}

}  // namespace codeloom
