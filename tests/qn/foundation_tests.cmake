# Strings, exceptions, task memory, checked integers and host error codes.
set(QN_FOUNDATION_TESTS
  dsc/NumericCastTest.cpp
  dsc/SafeIntegerTest.cpp
  dsc/StringBaseTest.cpp
  dsc/StringBaseTextTest.cpp
  dsc/Utf8ToWideTest.cpp
  dsc/WideToUtf8Test.cpp
  dsc/exception/ExceptionTest.cpp
  dsc/osdep/AllocationFaultTest.cpp
  dsc/osdep/OSExceptionTest.cpp
  dsc/osdep/PageMemoryTest.cpp
  dsc/osdep/PoolAllocatorTest.cpp
  dsc/osdep/SizeClassTest.cpp
  dsc/osdep/TaskMemoryTest.cpp
  dsc/zk/ThrowIfZKErrorTest.cpp
)
