// vxDebugScript("/usr/share/qrex/runtime/debug/vesk_gdb.py"), once in a program at file level: gdb loads that script
// with the program, where its auto-load safe path allows. Elsewhere than in ELF programs it is nothing.

#if defined(__ELF__)
#define vxDebugScript(PATH)                                       \
  __asm__(                                                        \
      ".pushsection \".debug_gdb_scripts\", \"MS\",@progbits,1\n" \
      ".byte 1\n.asciz \"" PATH "\"\n.popsection\n");
#else
#define vxDebugScript(PATH)
#endif
