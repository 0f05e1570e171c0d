// Empty: the tests' precompiled header is built with this file.
