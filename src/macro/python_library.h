// The part of Python 2.7's embedding interface that the bridge uses. The library is opened at run time, so the few
// layouts and constants that its headers would give are here, as a 64-bit release build of Python 2.7 has them.
#pragma once

#include <cstdint>
#include <string>

namespace qrex::python {

struct Type;
struct Object {
  intptr_t referenceCount;
  const Type* type;
};
struct Type : Object {
  intptr_t size;
  const char* name;
};
struct Method {
  const char* name;
  Object* (*function)(Object* self, Object* arguments);
  int flags;
  const char* doc;
};

constexpr int kFileInput = 257;    // Py_file_input
constexpr int kEvalInput = 258;    // Py_eval_input
constexpr int kVarArgs = 1;        // METH_VARARGS
constexpr int kApiVersion = 1013;  // PYTHON_API_VERSION

struct Library {
  int* Py_NoSiteFlag;
  void (*Py_SetPythonHome)(char* path);
  int (*Py_IsInitialized)();
  void (*Py_InitializeEx)(int installSignalHandlers);
  int (*PyImport_AppendInittab)(const char* name, void (*initialise)());
  Object* (*Py_InitModule4_64)(const char* name, Method* methods, const char* doc, Object* self, int apiVersion);
  Object* (*PyImport_ImportModule)(const char* name);
  Object* (*PyImport_AddModule)(const char* name);
  Object* (*PyModule_GetDict)(Object* module);
  Object* (*PyDict_GetItemString)(Object* dictionary, const char* key);
  int (*PyRun_SimpleStringFlags)(const char* code, void* flags);
  Object* (*PyRun_StringFlags)(const char* code, int start, Object* globals, Object* locals, void* flags);
  Object* (*Py_CompileStringFlags)(const char* code, const char* fileName, int start, void* flags);
  Object* (*PyEval_EvalCode)(Object* code, Object* globals, Object* locals);
  Object* (*PyErr_Occurred)();
  int (*PyErr_ExceptionMatches)(Object* exception);
  void (*PyErr_Fetch)(Object** type, Object** value, Object** traceback);
  void (*PyErr_NormalizeException)(Object** type, Object** value, Object** traceback);
  void (*PyErr_Print)();
  void (*PyErr_Clear)();
  void (*PyErr_SetString)(Object* exception, const char* message);
  int (*PyArg_ParseTuple)(Object* arguments, const char* format, ...);
  int (*PyType_IsSubtype)(const Type* type, const Type* base);
  long (*PyInt_AsLong)(Object* object);
  double (*PyFloat_AsDouble)(Object* object);
  const char* (*PyString_AsString)(Object* object);
  Object* (*PyObject_Str)(Object* object);
  intptr_t (*PyList_Size)(Object* list);
  Object* (*PyList_GetItem)(Object* list, intptr_t index);
  void (*Py_IncRef)(Object* object);
  void (*Py_DecRef)(Object* object);
  Type* PyInt_Type;
  Type* PyFloat_Type;
  Type* PyString_Type;
  Type* PyList_Type;
  Object** PyExc_SystemExit;
  Object** PyExc_IOError;
  Object* _Py_NoneStruct;
};

// Opens the library and finds every symbol. False: `error` tells what was tried and why it failed.
bool LoadLibrary(Library& library, std::string& error);

}  // namespace qrex::python
