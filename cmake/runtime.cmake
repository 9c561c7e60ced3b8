# The runtime as it is installed: built by the tool itself, in both configurations, and described as a project that comes
# built. Called with the rule's variables:
#   QREX, RELEASE     the program and its release
#   SOURCE, FOLDER    the sources of the runtime; where it is built
#   COMPILER, PATH    gcc or clang, as configurations name them; the folders of their tools
#   CXX, STRIP        the compiler itself; what takes debug information out
# What is to be installed comes to stand in FOLDER/runtime (a root of virtualTree) and FOLDER/include (translated headers).
set(tree ${FOLDER}/tree)
set(library Vesk/vxObject)

# What the library is built with is checked wherever its headers are read. The line goes in place of a blank one.
execute_process(COMMAND ${CXX} -std=c++17 -E -x c++ - INPUT_FILE ${SOURCE}/../cmake/runtime_modes.txt
                OUTPUT_VARIABLE modes COMMAND_ERROR_IS_FATAL ANY)
