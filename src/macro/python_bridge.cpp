#include "macro/python_bridge.h"

#include <memory>

#include "lex/scanner.h"
#include "macro/python_library.h"
#include "platform/console.h"
#include "platform/dynamic_library.h"
#include "platform/python_places.h"
#include "platform/system.h"
#include "text/exceptions.h"
#include "text/text_writer.h"
#include "text/trace.h"

namespace qrex {

namespace {

using namespace python;

constexpr int kMaxListNesting = 1000;

constexpr char kBootstrap[] =
    "import sys\n"
    "import stream_hooks\n"
    "class myStdOut:\n"
    "    def write(self,string):\n"
    "        stream_hooks.WriteToStdOut(string)\n"
    "class myStdErr:\n"
    "    def write(self,string):\n"
    "        stream_hooks.WriteToStdErr(string)\n"
    "sys.stdout = myStdOut()\n"
    "sys.stderr = myStdErr()\n";

// What would end the process without a word, or make another program of it, is an error like sys.exit(); in a child of
// this process it is what it ever was.
constexpr char kGuards[] =
    "def guard(name):\n"
    "    import os\n"
    "    system = __import__(os.name)\n"
    "    call, process = getattr(system, name), os.getpid()\n"
    "    def guarded(*arguments):\n"
    "        if os.getpid() == process:\n"
    "            raise SystemExit('os.%s(%s)' % (name, ', '.join(map(repr, arguments))))\n"
    "        return call(*arguments)\n"
    "    for module in (os, system):\n"
    "        setattr(module, name, guarded)\n"
    "for name in ('_exit', 'execv', 'execve'):\n"
    "    guard(name)\n"
    "del guard, name\n";

Library py;
bool pythonStarted = false;
Object* mainDict = nullptr;
MemoryTextWriter& StderrWriter() {
  static MemoryTextWriter writer;
  return writer;
}

struct Release {
  void operator()(Object* object) const { py.Py_DecRef(object); }
};
using OwnedObject = std::unique_ptr<Object, Release>;

Object* None() {
  py.Py_IncRef(py._Py_NoneStruct);
  return py._Py_NoneStruct;
}

// Called by Python: no exception may leave them.
Object* WriteToStdOut(Object*, Object* arguments) {
  const char* text;
  if (!py.PyArg_ParseTuple(arguments, "s", &text)) return nullptr;
  try {
    WriteToConsole(text);
    platform::HideStatusLine();
    platform::FlushStdout();  // what Python writes past its `sys.stdout` comes behind
  } catch (const IException& exception) {
    py.PyErr_SetString(*py.PyExc_IOError, ExceptionText(exception).c_str());
    return nullptr;
  }
  return None();
}

Object* WriteToStdErr(Object*, Object* arguments) {
  const char* text;
  if (!py.PyArg_ParseTuple(arguments, "s", &text)) return nullptr;
  StderrWriter() << text;
  return None();
}

void InitialiseStreamHooks() {
  static Method methods[] = {{"WriteToStdOut", WriteToStdOut, kVarArgs, "Write to stdout"},
                             {"WriteToStdErr", WriteToStdErr, kVarArgs, "Write to stderr"},
                             {nullptr, nullptr, 0, nullptr}};
  py.Py_InitModule4_64("stream_hooks", methods, nullptr, nullptr, kApiVersion);
}

// The standard library lies beside the shared library. Without this Python would look for it along PATH, where another
// version may come first.
void SetPythonHome() {
  static std::string home;  // Python keeps the pointer
  if (platform::EnvironmentValue("PYTHONHOME")) return;
  home = platform::PythonHomeOf(platform::LibraryPathOf(reinterpret_cast<const void*>(py.Py_InitializeEx)));
  if (!home.empty()) py.Py_SetPythonHome(home.data());
}

bool StartPython(std::string& error) {
  if (pythonStarted) return true;
  pythonStarted = true;
  if (!LoadLibrary(py, error)) return false;
  if (py.PyImport_AppendInittab("stream_hooks", InitialiseStreamHooks) == -1) {
    error = "PyImport_AppendInittab failed";
    return false;
  }
  SetPythonHome();
  // A `site` that fails while Python starts would end the process, so it is imported by hand. No signal handlers: the
  // user's interrupt ends the tool as ever.
  const bool importSite = *py.Py_NoSiteFlag == 0;
  *py.Py_NoSiteFlag = 1;
  py.Py_InitializeEx(0);
  if (py.PyRun_SimpleStringFlags(kBootstrap, nullptr) != 0) {
    error = "PyRun_SimpleString failed on the vesk bootstrap code";
    return false;
  }
  if (importSite && !OwnedObject(py.PyImport_ImportModule("site"))) {
    error = "PyImport_ImportModule failed for the site module";
    return false;
  }
  if (py.PyRun_SimpleStringFlags(kGuards, nullptr) != 0) {
    error = "PyRun_SimpleString failed on the vesk bootstrap code";
    return false;
  }
  Object* mainModule = py.PyImport_AddModule("__main__");
  if (!mainModule) {
    error = "PyImport_AddModule failed for the __main__ module";
    return false;
  }
  mainDict = py.PyModule_GetDict(mainModule);
  if (!py.PyDict_GetItemString(mainDict, "__builtins__")) {
    error = "__main__ module is missing __builtins__";
    return false;
  }
  return true;
}

// PyErr_Print would carry out a sys.exit(): here it is an error like any other.
std::string TakeSystemExit() {
  Object *type, *value, *traceback;
  py.PyErr_Fetch(&type, &value, &traceback);
  py.PyErr_NormalizeException(&type, &value, &traceback);
  const OwnedObject owned[] = {OwnedObject(type), OwnedObject(value), OwnedObject(traceback)};
  const OwnedObject text(value ? py.PyObject_Str(value) : nullptr);
  const char* code = text ? py.PyString_AsString(text.get()) : nullptr;
  return "SystemExit: " + std::string(code ? code : "") + "\n";
}

// True if a Python error was pending: its traceback is the text, and it is pending no longer.
bool TakePythonError(std::string& text) {
  text.clear();
  if (!py.PyErr_Occurred()) return false;
  if (py.PyErr_ExceptionMatches(*py.PyExc_SystemExit)) {
    text = TakeSystemExit();
  } else {
    StderrWriter().TakeText();
    py.PyErr_Print();
    text = StderrWriter().TakeText();
  }
  py.PyErr_Clear();
  return true;
}

void EnsurePython(const char* position) {
  static std::string failure;  // of the first attempt: a later one reports it again
  std::string error, pythonText;
  if (failure.empty() && !StartPython(error)) {
    failure = "Python initialisation error: " + error;
    const bool isRunning = py.Py_IsInitialized && py.Py_IsInitialized();
    if (isRunning && TakePythonError(pythonText)) failure += " : " + pythonText;
  }
  if (!failure.empty()) throw LexScannerException(failure, position);
}

[[noreturn]] void FailPython(const char* what, const char* position) {
  std::string text;
  TakePythonError(text);
  throw LexScannerException(what + text, position);
}

void WritePythonValue(TextWriter& writer, Object* object, const char* position, int nesting) {
  auto isA = [&](const Type* type) { return py.PyType_IsSubtype(object->type, type) != 0; };
  if (isA(py.PyInt_Type)) {
    writer << static_cast<int32_t>(py.PyInt_AsLong(object));
  } else if (isA(py.PyFloat_Type)) {
    writer << py.PyFloat_AsDouble(object);
  } else if (isA(py.PyString_Type)) {
    writer << py.PyString_AsString(object);
  } else if (isA(py.PyList_Type)) {
    if (nesting == kMaxListNesting) throw LexScannerException("Python list nested too deeply", position);
    writer << "[";
    const intptr_t size = py.PyList_Size(object);
    for (intptr_t i = 0; i < size; ++i) {
      if (i > 0) writer << ",";
      WritePythonValue(writer, py.PyList_GetItem(object, i), position, nesting + 1);
    }
    writer << "]";
  } else {
    throw LexScannerException(std::string("Can't convert python result of type ") + object->type->name, position);
  }
}

// The tool and Python's own file objects write to one output in turn. Paths of the run are relative to the folder in
// which it began, wherever Python went.
struct PythonScope {
  PythonScope() {
    platform::HideStatusLine();
    platform::FlushStdout();
  }
  ~PythonScope() {
    platform::FlushAllStreams();
    folder.Return();
  }
  const platform::WorkingFolder folder;
};

}  // namespace

std::string EvalPython(const std::string& expression, const char* position) {
  const PythonScope scope;
  EnsurePython(position);
  const OwnedObject result(py.PyRun_StringFlags(expression.c_str(), kEvalInput, mainDict, mainDict, nullptr));
  if (!result) FailPython("Eval python error: ", position);
  MemoryTextWriter writer;
  WritePythonValue(writer, result.get(), position, 0);
  return writer.TakeText();
}

void RunPython(const std::string& fileName, const std::string& code, const char* position) {
  const PythonScope scope;
  EnsurePython(position);
  const OwnedObject compiled(py.Py_CompileStringFlags(code.c_str(), fileName.c_str(), kFileInput, nullptr));
  if (!compiled) FailPython("Python compilation error: ", position);
  if (!OwnedObject(py.PyEval_EvalCode(compiled.get(), mainDict, mainDict))) FailPython("RunPython error: ", position);
}

}  // namespace qrex
