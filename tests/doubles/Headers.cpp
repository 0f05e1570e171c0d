// An empty file: the precompiled headers of the tests are built beside it.
