/* CMPI platform glue: the types behind the broker's thread services, and symbol visibility.
 *
 * CMPI_EXTERN_C marks the factory functions that a CIM server looks up by name in a provider
 * library; CMPI_EXPORT keeps a symbol visible in a library that hides everything else.
 */
#ifndef _CMPIOS_H_
#define _CMPIOS_H_

#include <stddef.h>
#include <stdlib.h>

#include "cmpipl.h"

#define CMPI_THREAD_TYPE void*
#define CMPI_MUTEX_TYPE void*
#define CMPI_COND_TYPE void*

#if defined(CMPI_PLATFORM_WIN32_IX86_MSVC)
#define CMPI_THREAD_RETURN unsigned
#define CMPI_THREAD_CDECL __stdcall
#define CMPI_EXPORT __declspec(dllexport)
#define CMPI_IMPORT __declspec(dllimport)
#ifndef HAVE_STRUCT_TIMESPEC
#define HAVE_STRUCT_TIMESPEC
struct timespec {
    long tv_sec;
    long tv_nsec;
};
#endif
#else
#define CMPI_THREAD_RETURN void*
#if defined(CMPI_PLATFORM_ZOS_ZSERIES_IBM) && defined(__cplusplus)
#define CMPI_THREAD_CDECL __cdecl
#else
#define CMPI_THREAD_CDECL
#endif
#if defined(__GNUC__) && __GNUC__ >= 4
#define CMPI_EXPORT __attribute__((visibility("default")))
#define CMPI_IMPORT __attribute__((visibility("default")))
#else
#define CMPI_EXPORT
#define CMPI_IMPORT
#endif
#endif

#if defined(CMPI_PLATFORM_ZOS_ZSERIES_IBM)
#include <pthread.h>
#define CMPI_THREAD_KEY_TYPE pthread_key_t
#else
#define CMPI_THREAD_KEY_TYPE unsigned int
#endif

#ifdef __cplusplus
#define CMPI_EXTERN_C extern "C" CMPI_EXPORT
#else
#define CMPI_EXTERN_C CMPI_EXPORT
#endif

#endif
