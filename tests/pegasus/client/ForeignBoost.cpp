// A host with a Boost of its own: the test program exports the names that the client library's Boost has, and the
// client library must keep to its own. A call of one of these ends the test program.
#include <cstdlib>

#define FOREIGN(name, symbol)                                                                                          \
    extern "C" void name() __asm__(symbol);                                                                            \
    extern "C" void name()                                                                                             \
    {                                                                                                                  \
        std::abort();                                                                                                  \
    }

FOREIGN(foreignMakeErrorCode, "_ZN5boost5beast4http15make_error_codeENS1_5errorE")
FOREIGN(foreignMessage, "_ZNK5boost5beast4http6detail19http_error_category7messageB5cxx11Ei")
