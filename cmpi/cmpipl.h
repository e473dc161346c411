/* CMPI platform selection.
 *
 * The published headers ask the build for exactly one CMPI_PLATFORM_ symbol. A build that names
 * none gets the one of its compiler, so that a plain -I is enough on the platforms we build for;
 * the platform symbols of CIM servers are accepted as well.
 */
#ifndef _CMPIPL_H_
#define _CMPIPL_H_

#if defined(PEGASUS_PLATFORM_LINUX_GENERIC_GNU) && !defined(CMPI_PLATFORM_LINUX_GENERIC_GNU)
#define CMPI_PLATFORM_LINUX_GENERIC_GNU 1
#endif
#if defined(PEGASUS_PLATFORM_AIX_RS_IBMCXX) && !defined(CMPI_PLATFORM_AIX_RS_IBMCXX)
#define CMPI_PLATFORM_AIX_RS_IBMCXX 1
#endif
#if (defined(PEGASUS_PLATFORM_ZOS_ZSERIES_IBM) || defined(PEGASUS_PLATFORM_ZOS_ZSERIES64_IBM)) && \
    !defined(CMPI_PLATFORM_ZOS_ZSERIES_IBM)
#define CMPI_PLATFORM_ZOS_ZSERIES_IBM 1
#endif

#if !defined(CMPI_PLATFORM_LINUX_GENERIC_GNU) && !defined(CMPI_PLATFORM_HPUX_ACC) &&         \
    !defined(CMPI_PLATFORM_WIN32_IX86_MSVC) && !defined(CMPI_PLATFORM_SOLARIS_SPARC_GNU) &&  \
    !defined(CMPI_PLATFORM_SOLARIS_SPARC_CC) && !defined(CMPI_PLATFORM_AIX_RS_IBMCXX) &&     \
    !defined(CMPI_PLATFORM_ZOS_ZSERIES_IBM) && !defined(CMPI_PLATFORM_TRU64_ALPHA_DECCXX) && \
    !defined(CMPI_PLATFORM_OS400_ISERIES_IBM) && !defined(CMPI_PLATFORM_DARWIN_PPC_GNU) &&   \
    !defined(CMPI_PLATFORM_DARWIN_IX86_GNU) && !defined(CMPI_PLATFORM_VMS_ALPHA_DECCXX) &&   \
    !defined(CMPI_PLATFORM_VMS_IA64_DECCXX)
#if defined(__linux__) && defined(__GNUC__)
#define CMPI_PLATFORM_LINUX_GENERIC_GNU 1
#else
#error "define one CMPI_PLATFORM_ symbol, for example CMPI_PLATFORM_LINUX_GENERIC_GNU"
#endif
#endif

#endif
