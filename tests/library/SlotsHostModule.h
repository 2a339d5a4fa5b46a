/* How SlotsHost.c comes by the library. */
#ifndef SLOTS_HOST_MODULE_H
#define SLOTS_HOST_MODULE_H

/* Null if the file can't be loaded. */
void* LoadLibraryFile(const char* file);

/* The address of a function that the library exports, or that the system has in its place; null if neither does. */
void* FindExport(void* library, const char* name);

#endif
