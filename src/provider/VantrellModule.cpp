#include "provider/VantrellModule.h"

#include "provider/LocalDochost.h"

vantrell::DochostExtension* vantrellCreateExtension() { return new vantrell::LocalDochost(); }
