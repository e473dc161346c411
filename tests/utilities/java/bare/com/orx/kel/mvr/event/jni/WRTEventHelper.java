package com.orx.kel.mvr.event.jni;

/** Has none of the methods that the library asks for. */
public final class WRTEventHelper {}
