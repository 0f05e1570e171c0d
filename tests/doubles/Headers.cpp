// Empty: the precompiled header of the tests is built beside it.
