// Nothing: this program is where the compiled headers of the tests are kept (tests/CMakeLists.txt).
