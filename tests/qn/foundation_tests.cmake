# Strings, exceptions, task memory and checked integers.
set(QN_FOUNDATION_TESTS
)
