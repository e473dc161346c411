# What the bridge to Java is built with: the headers of JNI, and a compiler for the stand-in's event
# classes. Both come with a JDK. The VM itself is looked for when somebody wants events.

file(GLOB zem_javas /usr/lib/jvm/*/include)
find_path(ZEM_JNI_INCLUDE jni.h HINTS $ENV{JAVA_HOME}/include
  PATHS /usr/lib/jvm/default-java/include ${zem_javas})
find_path(ZEM_JNI_MD_INCLUDE jni_md.h HINTS ${ZEM_JNI_INCLUDE}/linux)
find_package(Java 17 QUIET COMPONENTS Development)
if(ZEM_JNI_INCLUDE AND ZEM_JNI_MD_INCLUDE AND Java_FOUND)
  set(ZEM_JAVA ON)
  include(UseJava)
  set(CMAKE_JAVA_COMPILE_FLAGS --release 17 -Xlint:all -Werror)
else()
  set(ZEM_JAVA OFF)
  message(STATUS "Java bridge and events: off, no JDK from 17 on is here "
    "(Debian: openjdk-17-jdk-headless)")
endif()
