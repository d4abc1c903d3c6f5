// The compiled header refers to the prologue of its interface definition; windows.h has declared all of it.
