// The tables that tie switches of the tools to properties of the option model. They are data: the parsers, the reverse
// mapping to command lines and the project generators walk them.
#pragma once

#include <span>
#include <string_view>

namespace qrex {

struct SwitchProperty {
  std::string_view name;  // a switch, or the name ahead of a `:`
  std::string_view property;
};

struct EnumeratedSwitch {
  std::string_view name;
  std::string_view property;
  std::string_view valueText;  // in the option map and the older project formats
  std::string_view valueName;  // in the newer project format; empty: it has none
};

// --- Compiler
inline constexpr SwitchProperty kSignedFlags[] = {
    // a `-` behind them negates
    {"/GR", "RuntimeTypeInfo"},
    {"/GL", "WholeProgramOptimization"},
    {"/GS", "BufferSecurityCheck"},
    {"/Gy", "EnableFunctionLevelLinking"},
    {"/fp:except", "FloatingPointExceptions"},
};

inline constexpr SwitchProperty kFlags[] = {
    {"/nologo", "SuppressStartupBanner"},
    {"/Oi", "EnableIntrinsicFunctions"},
    {"/Op", "ImproveFloatingPointConsistency"},
    {"/Oy", "OmitFramePointers"},
    {"/GT", "EnableFiberSafeOptimizations"},
    {"/X", "IgnoreStandardIncludePath"},
    {"/C", "KeepComments"},
    {"/GF", "StringPooling"},
    {"/Gm", "MinimalRebuild"},
    {"/RTCc", "SmallerTypeCheck"},
    {"/Za", "DisableLanguageExtensions"},
    {"/J", "DefaultCharIsUnsigned"},
    {"/openmp", "OpenMP"},
    {"/Fx", "ExpandAttributedSource"},
    {"/doc", "GenerateXMLDocumentationFiles"},
    {"/WX", "WarnAsError"},
    {"/Wp64", "Detect64BitPortabilityProblems"},
    {"/showIncludes", "ShowIncludes"},
    {"/u", "UndefineAllPreprocessorDefinitions"},
    {"/FC", "UseFullPaths"},
    {"/Zl", "OmitDefaultLibName"},
    {"/Zc:wchar_t", "TreatWChar_tAsBuiltInType"},
    {"/Zc:forScope", "ForceConformanceInForLoopScope"},
    {"/QRinterwork", "InterworkCalls"},
    {"/QRfpe", "EnableFloatingPointEmulation"},
};

inline constexpr EnumeratedSwitch kEnumerated[] = {
    {"/Od", "Optimization", "0", "Disabled"},
    {"/O1", "Optimization", "1", "MinSpace"},
    {"/O2", "Optimization", "2", "MaxSpeed"},
    {"/Ox", "Optimization", "3", "Full"},
    {"/Ob0", "InlineFunctionExpansion", "0", "Disabled"},
    {"/Ob1", "InlineFunctionExpansion", "1", "OnlyExplicitInline"},
    {"/Ob2", "InlineFunctionExpansion", "2", "AnySuitable"},
    {"/Ot", "FavorSizeOrSpeed", "1", "Speed"},
    {"/Os", "FavorSizeOrSpeed", "2", "Size"},
    {"/EHsc", "ExceptionHandling", "1", "Sync"},
    {"/EHa", "ExceptionHandling", "2", "Async"},
    {"/EHs", "ExceptionHandling", "?", "SyncCThrow"},
    {"/GX", "ExceptionHandling", "1", "Sync"},
    {"/RTCs", "BasicRuntimeChecks", "1", "StackFrameRuntimeCheck"},
    {"/RTCu", "BasicRuntimeChecks", "2", "UninitializedLocalUsageCheck"},
    {"/RTC1", "BasicRuntimeChecks", "3", "EnableFastChecks"},
    {"/RTCsu", "BasicRuntimeChecks", "3", "EnableFastChecks"},
    {"/GZ", "BasicRuntimeChecks", "3", "EnableFastChecks"},
    {"/MT", "RuntimeLibrary", "0", "MultiThreaded"},
    {"/MTd", "RuntimeLibrary", "1", "MultiThreadedDebug"},
    {"/MD", "RuntimeLibrary", "2", "MultiThreadedDLL"},
    {"/MDd", "RuntimeLibrary", "3", "MultiThreadedDebugDLL"},
    {"/Zp1", "StructMemberAlignment", "1", "Default"},
    {"/Zp2", "StructMemberAlignment", "2", "2Bytes"},
    {"/Zp4", "StructMemberAlignment", "4", "4Bytes"},
    {"/Zp8", "StructMemberAlignment", "8", "8Bytes"},
    {"/Zp16", "StructMemberAlignment", "16", "16Bytes"},
    {"/QRarch4", "CompileForArchitecture", "0", ""},
    {"/QRarch5", "CompileForArchitecture", "1", ""},
    {"/QRarch4t", "CompileForArchitecture", "2", ""},
    {"/QRarch5t", "CompileForArchitecture", "3", ""},
    {"/TC", "CompileAs", "1", "CompileAsC"},
    {"/TP", "CompileAs", "2", "CompileAsCpp"},
    {"/arch:SSE", "EnableEnhancedInstructionSet", "1", "StreamingSIMDExtensions"},
    {"/arch:SSE2", "EnableEnhancedInstructionSet", "2", "StreamingSIMDExtensions2"},
    {"/arch:AVX", "EnableEnhancedInstructionSet", "?", "AdvancedVectorExtensions"},
    {"/arch:IA32", "EnableEnhancedInstructionSet", "?", "NoExtensions"},
    {"/fp:precise", "FloatingPointModel", "0", "Precise"},
    {"/fp:strict", "FloatingPointModel", "1", "Strict"},
    {"/fp:fast", "FloatingPointModel", "2", "Fast"},
    {"/FA", "AssemblerOutput", "1", "AssemblyCode"},
    {"/FAcs", "AssemblerOutput", "2", "All"},
    {"/FAc", "AssemblerOutput", "3", "AssemblyAndMachineCode"},
    {"/FAs", "AssemblerOutput", "4", "AssemblyAndSourceCode"},
    {"/FR", "BrowseInformation", "1", "true"},
    {"/Fr", "BrowseInformation", "2", ""},
    {"/W0", "WarningLevel", "0", "TurnOffAllWarnings"},
    {"/W1", "WarningLevel", "1", "Level1"},
    {"/W2", "WarningLevel", "2", "Level2"},
    {"/W3", "WarningLevel", "3", "Level3"},
    {"/W4", "WarningLevel", "4", "Level4"},
    {"/Z7", "DebugInformationFormat", "1", "OldStyle"},
    {"/Zi", "DebugInformationFormat", "3", "ProgramDatabase"},
    {"/ZI", "DebugInformationFormat", "4", "EditAndContinue"},
    {"/Gd", "CallingConvention", "0", "Cdecl"},
    {"/Gr", "CallingConvention", "1", "FastCall"},
    {"/Gz", "CallingConvention", "2", "StdCall"},
    {"/errorReport:prompt", "ErrorReporting", "1", "Prompt"},
    {"/errorReport:queue", "ErrorReporting", "2", "Queue"},
    {"/errorReport:none", "ErrorReporting", "?", "None"},
    {"/errorReport:send", "ErrorReporting", "?", "Send"},
    {"/clr", "ManagedExtensions", "1", "true"},
    {"/clr:pure", "ManagedExtensions", "2", "Pure"},
    {"/clr:safe", "ManagedExtensions", "3", "Safe"},
    {"/clr:noAssembly", "ManagedExtensions", "3", "Safe"},
    {"/clr:oldSyntax", "ManagedExtensions", "4", "OldSyntax"},
};

inline constexpr SwitchProperty kFileNames[] = {
    {"/Fd", "ProgramDataBaseFileName"},
    {"/Fe", "OutputFile"},
    {"/Fo", "ObjectFile"},
    {"/Fp", "PrecompiledHeaderFile"},
};

inline constexpr SwitchProperty kLists[] = {
    {"/I", "AdditionalIncludeDirectories"},
    {"/D", "PreprocessorDefinitions"},
    {"/FI", "ForcedIncludeFiles"},
    {"/FU", "ForcedUsingFiles"},
    {"/U", "UndefinePreprocessorDefinitions"},
};

inline constexpr std::string_view kPassedOn[] = {"/MP", "/Zm", "/FD", "/bigobj"};  // by prefix

inline constexpr std::string_view kDeprecated[] = {
    // by prefix
    "/clr:noAssembly", "/Fr", "/Ge", "/GX", "/GZ", "/Gf", "/H", "/Og", "/QIfist", "/V", "/Yd", "/Ze", "/Zg",
};

inline constexpr std::string_view kWordsWithColon[] = {"fp", "Zc", "arch", "errorReport", "clr"};

// --- Resource compiler
inline constexpr SwitchProperty kResourceFlags[] = {
    {"/x", "IgnoreStandardIncludePath"},
    {"/v", "ShowProgress"},
};

inline constexpr SwitchProperty kResourceLists[] = {
    {"/I", "AdditionalIncludeDirectories"},
    {"/d", "PreprocessorDefinitions"},
    {"/u", "UndefinePreprocessorDefinitions"},
};

// --- Linker and librarian
inline constexpr SwitchProperty kLinkerFlags[] = {
    {"/NOLOGO", "SuppressStartupBanner"},
    {"/NOENTRY", "ResourceOnlyDLL"},
    {"/IGNOREIDL", "IgnoreEmbeddedIDL"},
    {"/NOASSEMBLY", "TurnOffAssemblyGeneration"},
    {"/DELAY:UNLOAD", "SupportUnloadOfDelayLoadedDLL"},
    {"/RELEASE", "SetChecksum"},
    {"/DEBUG", "GenerateDebugInformation"},
    {"/SWAPRUN:CD", "SwapRunFromCD"},
    {"/SWAPRUN:NET", "SwapRunFromNet"},
    {"/PROFILE", "Profile"},
    {"/MAPINFO:EXPORTS", "MapExports"},
    {"/MAP", "GenerateMapFile"},
    {"/NODEFAULTLIB", "IgnoreAllDefaultLibraries"},
    {"/DELAYSIGN", "DelaySign"},
    {"/ODR", "DetectOneDefinitionRule"},
};

inline constexpr EnumeratedSwitch kLinkerEnumerated[] = {
    {"/MACHINE:X86", "TargetMachine", "1", "MachineX86"},
    {"/MACHINE:IX86", "TargetMachine", "1", "MachineX86"},
    {"/MACHINE:I386", "TargetMachine", "1", "MachineX86"},
    {"/MACHINE:AM33", "TargetMachine", "2", "MachineAM33"},
    {"/MACHINE:ARM", "TargetMachine", "3", "MachineARM"},
    {"/MACHINE:EBC", "TargetMachine", "4", "MachineEBC"},
    {"/MACHINE:IA64", "TargetMachine", "5", "MachineIA64"},
    {"/MACHINE:M32R", "TargetMachine", "6", "MachineM32R"},
    {"/MACHINE:MIPS", "TargetMachine", "7", "MachineMIPS"},
    {"/MACHINE:MIPS16", "TargetMachine", "8", "MachineMIPS16"},
    {"/MACHINE:MIPSFPU", "TargetMachine", "9", "MachineMIPSFPU"},
    {"/MACHINE:MIPSFPU16", "TargetMachine", "10", "MachineMIPSFPU16"},
    {"/MACHINE:MIPSR41XX", "TargetMachine", "11", "MachineMIPSR41XX"},
    {"/MACHINE:SH3", "TargetMachine", "12", "MachineSH3"},
    {"/MACHINE:SH3DSP", "TargetMachine", "13", "MachineSH3DSP"},
    {"/MACHINE:SH4", "TargetMachine", "14", "MachineSH4"},
    {"/MACHINE:SH5", "TargetMachine", "15", "MachineSH5"},
    {"/MACHINE:THUMB", "TargetMachine", "16", "MachineTHUMB"},
    {"/MACHINE:X64", "TargetMachine", "17", "MachineX64"},
    {"/SUBSYSTEM:CONSOLE", "SubSystem", "1", "Console"},
    {"/SUBSYSTEM:WINDOWS", "SubSystem", "2", "Windows"},
    {"/SUBSYSTEM:NATIVE", "SubSystem", "3", "Native"},
    {"/SUBSYSTEM:EFI_APPLICATION", "SubSystem", "4", "EFI Application"},
    {"/SUBSYSTEM:EFI_BOOT_SERVICE_DRIVER", "SubSystem", "5", "EFI Boot Service Driver"},
    {"/SUBSYSTEM:EFI_ROM", "SubSystem", "6", "EFI ROM"},
    {"/SUBSYSTEM:EFI_RUNTIME_DRIVER", "SubSystem", "7", "EFI Runtime"},
    {"/SUBSYSTEM:POSIX", "SubSystem", "8", "POSIX"},
    {"/SUBSYSTEM:WINDOWSCE", "SubSystem", "9", ""},
    {"/OPT:NOREF", "OptimizeReferences", "1", "false"},
    {"/OPT:REF", "OptimizeReferences", "2", "true"},
    {"/OPT:NOICF", "EnableCOMDATFolding", "1", "false"},
    {"/OPT:ICF", "EnableCOMDATFolding", "2", "true"},
    {"/OPT:NOWIN98", "OptimizeForWindows98", "1", ""},
    {"/OPT:WIN98", "OptimizeForWindows98", "2", ""},
    {"/DRIVER", "Driver", "1", "Driver"},
    {"/DRIVER:UPONLY", "Driver", "2", "UpOnly"},
    {"/DRIVER:WDM", "Driver", "3", "WDM"},
    {"/ASSEMBLYDEBUG", "AssemblyDebug", "1", "true"},
    {"/ASSEMBLYDEBUG:DISABLE", "AssemblyDebug", "2", "false"},
    {"/INCREMENTAL:NO", "LinkIncremental", "1", "false"},
    {"/INCREMENTAL", "LinkIncremental", "2", "true"},
    {"/MANIFEST:NO", "GenerateManifest", "false", "false"},
    {"/MANIFEST", "GenerateManifest", "true", "true"},
    {"/MANIFESTUAC:NO", "EnableUAC", "1?", "false"},
    {"/MANIFESTUAC", "EnableUAC", "2?", "true"},
    {"/LEVEL='asInvoker'", "UACExecutionLevel", "1?", "AsInvoker"},
    {"/LEVEL='highestAvailable'", "UACExecutionLevel", "2?", "HighestAvailable"},
    {"/LEVEL='requireAdministrator'", "UACExecutionLevel", "3?", "RequireAdministrator"},
    {"/uiAccess='false'", "UACUIAccess", "false?", "false"},
    {"/uiAccess='true'", "UACUIAccess", "true?", "true"},
    {"/FIXED:NO", "FixedBaseAddress", "1", "false"},
    {"/FIXED", "FixedBaseAddress", "2", "true"},
    {"/TSAWARE:NO", "TerminalServerAware", "1", "false"},
    {"/TSAWARE", "TerminalServerAware", "2", "true"},
    {"/LARGEADDRESSAWARE:NO", "LargeAddressAware", "1", "false"},
    {"/LARGEADDRESSAWARE", "LargeAddressAware", "2", "true"},
    {"/ALLOWBIND:NO", "PreventDllBinding", "?1", "false"},
    {"/ALLOWBIND", "PreventDllBinding", "?2", "true"},
    {"/WX:NO", "TreatLinkerWarningAsErrors", "?1", "false"},
    {"/WX", "TreatLinkerWarningAsErrors", "?2", "true"},
    {"/WINMD:NO", "GenerateWindowsMetadata", "?1", "false"},
    {"/WINMD", "GenerateWindowsMetadata", "?2", "true"},
    {"/WINMDDELAYSIGN:NO", "WindowsMetadataLinkDelaySign", "?1", "false"},
    {"/WINMDDELAYSIGN", "WindowsMetadataLinkDelaySign", "?2", "true"},
    {"/FORCE", "ForceFileOutput", "?1", "Enabled"},
    {"/FORCE:MULTIPLE", "ForceFileOutput", "?2", "MultiplyDefinedSymbolOnly"},
    {"/FORCE:UNRESOLVED", "ForceFileOutput", "?3", "UndefinedSymbolOnly"},
    {"/FUNCTIONPADMIN", "CreateHotPatchableImage", "?1", "Enabled"},
    {"/FUNCTIONPADMIN:5", "CreateHotPatchableImage", "?2", "X86Image"},
    {"/FUNCTIONPADMIN:6", "CreateHotPatchableImage", "?3", "X64Image"},
    {"/FUNCTIONPADMIN:16", "CreateHotPatchableImage", "?4", "ItaniumImage"},
    {"/LTCG:NOSTATUS", "LinkStatus", "?1", "false"},
    {"/LTCG:STATUS", "LinkStatus", "?2", "true"},
    {"/DYNAMICBASE:NO", "RandomizedBaseAddress", "?1", "false"},
    {"/DYNAMICBASE", "RandomizedBaseAddress", "?2", "true"},
    {"/NXCOMPAT:NO", "DataExecutionPrevention", "?1", "false"},
    {"/NXCOMPAT", "DataExecutionPrevention", "?2", "true"},
    {"/DELAY:NOBIND", "SupportNobindOfDelayLoadedDLL", "?true", "true"},
    {"/CLRUNMANAGEDCODECHECK:NO", "CLRUnmanagedCodeCheck", "false", "false"},
    {"/CLRUNMANAGEDCODECHECK", "CLRUnmanagedCodeCheck", "true", "true"},
    {"/CLRSUPPORTLASTERROR:NO", "CLRSupportLastError", "?1", "Disabled"},
    {"/CLRSUPPORTLASTERROR:SYSTEMDLL", "CLRSupportLastError", "?2", "SystemDlls"},
    {"/CLRSUPPORTLASTERROR", "CLRSupportLastError", "?3", "Enabled"},
    {"/SAFESEH:NO", "ImageHasSafeExceptionHandlers", "?1", "false"},
    {"/SAFESEH", "ImageHasSafeExceptionHandlers", "?2", "true"},
    {"/LTCG", "LinkTimeCodeGeneration", "1", "UseLinkTimeCodeGeneration"},
    {"/LTCG:PGINSTRUMENT", "LinkTimeCodeGeneration", "2", "PGInstrument"},
    {"/LTCG:PGOPTIMIZE", "LinkTimeCodeGeneration", "3", "PGOptimization"},
    {"/LTCG:PGUPDATE", "LinkTimeCodeGeneration", "4", "PGUpdate"},
    {"/VERBOSE", "ShowProgress", "1", "LinkVerbose"},
    {"/VERBOSE:LIB", "ShowProgress", "2", "LinkVerboseLib"},
    {"/VERBOSE:ICF", "ShowProgress", "?3", "LinkVerboseICF"},
    {"/VERBOSE:REF", "ShowProgress", "?4", "LinkVerboseREF"},
    {"/VERBOSE:SAFESEH", "ShowProgress", "?5", "LinkVerboseSAFESEH"},
    {"/VERBOSE:CLR", "ShowProgress", "?6", "LinkVerboseCLR"},
    {"/ALLOWISOLATION:NO", "AllowIsolation", "false", "false"},
    {"/ALLOWISOLATION", "AllowIsolation", "true", "true"},
    {"/CLRTHREADATTRIBUTE:NONE", "CLRThreadAttribute", "0", "DefaultThreadingAttribute"},
    {"/CLRTHREADATTRIBUTE:MTA", "CLRThreadAttribute", "1", "MTAThreadingAttribute"},
    {"/CLRTHREADATTRIBUTE:STA", "CLRThreadAttribute", "2", "STAThreadingAttribute"},
    {"/CLRIMAGETYPE:IJW", "CLRImageType", "1", "ForceIJWImage"},
    {"/CLRIMAGETYPE:PURE", "CLRImageType", "2", "ForcePureILImage"},
    {"/CLRIMAGETYPE:SAFE", "CLRImageType", "3", "ForceSafeILImage"},
    {"/ERRORREPORT:NONE", "ErrorReporting", "0", "NoErrorReport"},
    {"/ERRORREPORT:PROMPT", "ErrorReporting", "1", "PromptImmediately"},
    {"/ERRORREPORT:QUEUE", "ErrorReporting", "2", "QueueForNextLogin"},
    {"/ERRORREPORT:SEND", "ErrorReporting", "3?", "SendErrorReport"},
};

inline constexpr SwitchProperty kLinkerValues[] = {
    // name, then `:` and a quoted argument
    {"DEF", "ModuleDefinitionFile"},  {"BASE", "BaseAddress"},
    {"ENTRY", "EntryPointSymbol"},    {"IDLOUT", "MergedIDLBaseFileName"},
    {"TLBOUT", "TypeLibraryFile"},    {"TLBID", "TypeLibraryResourceID"},
    {"PGD", "ProfileGuidedDatabase"}, {"ORDER", "FunctionOrder"},
    {"MANIFESTFILE", "ManifestFile"}, {"OUT", "OutputFile"},
    {"VERSION", "Version"},           {"IMPLIB", "ImportLibrary"},
    {"PDB", "ProgramDatabaseFile"},   {"PDBSTRIPPED", "StripPrivateSymbols"},
    {"MIDL", "MidlCommandFile"},      {"KEYFILE", "KeyFile"},
    {"KEYCONTAINER", "KeyContainer"},
};

inline constexpr SwitchProperty kLinkerLists[] = {
    {"MANIFESTDEPENDENCY", "AdditionalManifestDependencies"},
    {"ASSEMBLYMODULE", "AddModuleNamesToAssembly"},
    {"ASSEMBLYRESOURCE", "EmbedManagedResourceFile"},
    {"ASSEMBLYLINKRESOURCE", "AssemblyLinkResource"},
    {"INCLUDE", "ForceSymbolReferences"},
    {"DELAYLOAD", "DelayLoadDLLs"},
    {"NODEFAULTLIB", "IgnoreDefaultLibraryNames"},
    {"LIBPATH", "AdditionalLibraryDirectories"},
};

inline constexpr SwitchProperty kLibrarianFlags[] = {
    {"/NOLOGO", "SuppressStartupBanner"},
    {"/NODEFAULTLIB", "IgnoreAllDefaultLibraries"},
};

inline constexpr SwitchProperty kLibrarianValues[] = {
    {"DEF", "ModuleDefinitionFile"},
    {"OUT", "OutputFile"},
};

inline constexpr SwitchProperty kLibrarianLists[] = {
    {"INCLUDE", "ForceSymbolReferences"},
    {"NODEFAULTLIB", "IgnoreDefaultLibraryNames"},
    {"LIBPATH", "AdditionalLibraryDirectories"},
    {"EXPORT", "ExportNamedFunctions"},
};

inline constexpr std::string_view kDefaultLibraries[] = {
    "kernel32.lib", "user32.lib",   "gdi32.lib",   "winspool.lib", "comdlg32.lib",
    "advapi32.lib", "shell32.lib",  "ole32.lib",   "oleaut32.lib", "uuid.lib",
    "odbc32.lib",   "odbccp32.lib", "coredll.lib", "corelibc.lib", "commctrl.lib",
};

template <typename Rows>
auto FindSwitch(const Rows& rows, std::string_view name) {
  for (const auto& row : rows) {
    if (row.name == name) return &row;
  }
  return static_cast<decltype(&rows[0])>(nullptr);
}

template <typename Rows>
auto FindProperty(const Rows& rows, std::string_view property) {
  for (const auto& row : rows) {
    if (row.property == property) return &row;
  }
  return static_cast<decltype(&rows[0])>(nullptr);
}

template <typename Rows>
const EnumeratedSwitch* FindValue(const Rows& rows, std::string_view property, std::string_view valueText) {
  for (const EnumeratedSwitch& row : rows) {
    if (row.property == property && row.valueText == valueText) return &row;
  }
  return nullptr;
}

}  // namespace qrex
