#include <Pegasus/Client/CIMClientException.h>
