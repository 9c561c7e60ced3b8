" C++ has read what there is for C; this is for a syntax of C++ that stands on its own.
runtime! after/syntax/c.vim
