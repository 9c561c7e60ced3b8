#include "macro/python_library.h"

#include <optional>
#include <vector>

#include "platform/dynamic_library.h"
#include "platform/python_places.h"
#include "platform/system.h"

namespace qrex::python {

namespace {

std::vector<std::string> Candidates() {
  if (const std::optional<std::string> named = platform::EnvironmentValue("QREX_PYTHON")) return {*named};
  std::vector<std::string> candidates;
#ifdef QREX_PYTHON_LIBRARY
  candidates.push_back(QREX_PYTHON_LIBRARY);
#endif
  candidates.push_back(platform::PythonLibraryName());
  return candidates;
}

class SymbolFinder {
 public:
  SymbolFinder(void* handle, std::string& missing) : m_handle(handle), m_missing(missing) {}

  template <typename Pointer>
  void Find(Pointer*& target, const char* name) {
    target = reinterpret_cast<Pointer*>(platform::FindSymbol(m_handle, name));
    if (!target && m_missing.empty()) m_missing = name;
  }

 private:
  void* m_handle;
  std::string& m_missing;
};

std::string FindSymbols(Library& library, void* handle) {
  std::string missing;
  SymbolFinder finder(handle, missing);
#define QREX_FIND(NAME) finder.Find(library.NAME, #NAME)
  QREX_FIND(Py_NoSiteFlag);
  QREX_FIND(Py_SetPythonHome);
  QREX_FIND(Py_IsInitialized);
  QREX_FIND(Py_InitializeEx);
  QREX_FIND(PyImport_AppendInittab);
  QREX_FIND(Py_InitModule4_64);
  QREX_FIND(PyImport_ImportModule);
  QREX_FIND(PyImport_AddModule);
  QREX_FIND(PyModule_GetDict);
  QREX_FIND(PyDict_GetItemString);
  QREX_FIND(PyRun_SimpleStringFlags);
  QREX_FIND(PyRun_StringFlags);
  QREX_FIND(Py_CompileStringFlags);
  QREX_FIND(PyEval_EvalCode);
  QREX_FIND(PyErr_Occurred);
  QREX_FIND(PyErr_ExceptionMatches);
  QREX_FIND(PyErr_Fetch);
  QREX_FIND(PyErr_NormalizeException);
  QREX_FIND(PyErr_Print);
  QREX_FIND(PyErr_Clear);
  QREX_FIND(PyErr_SetString);
  QREX_FIND(PyArg_ParseTuple);
  QREX_FIND(PyType_IsSubtype);
  QREX_FIND(PyInt_AsLong);
  QREX_FIND(PyFloat_AsDouble);
  QREX_FIND(PyString_AsString);
  QREX_FIND(PyObject_Str);
  QREX_FIND(PyList_Size);
  QREX_FIND(PyList_GetItem);
  QREX_FIND(Py_IncRef);
  QREX_FIND(Py_DecRef);
  QREX_FIND(PyInt_Type);
  QREX_FIND(PyFloat_Type);
  QREX_FIND(PyString_Type);
  QREX_FIND(PyList_Type);
  QREX_FIND(PyExc_SystemExit);
  QREX_FIND(PyExc_IOError);
  QREX_FIND(_Py_NoneStruct);
#undef QREX_FIND
  return missing;
}

}  // namespace

bool LoadLibrary(Library& library, std::string& error) {
  std::string tried;
  for (const std::string& candidate : Candidates()) {
    std::string reason;
    if (void* handle = platform::LoadDynamicLibrary(candidate, reason)) {
      const std::string missing = FindSymbols(library, handle);
      if (missing.empty()) return true;
      reason = candidate + ": no symbol " + missing;
    }
    tried += "\n        " + reason;
  }
  error = "Python 2.7 can't be loaded; tried" + tried;
  return false;
}

}  // namespace qrex::python
