/// Marks what libzemutilities.so shows to the libraries built on it; all else is hidden.
#ifndef ZEM_EXPORT_H
#define ZEM_EXPORT_H

#define ZEM_EXPORT __attribute__((visibility("default")))

#endif
