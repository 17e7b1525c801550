#ifndef PEGASUS_COMMON_ELEMENTDECODER_H
#define PEGASUS_COMMON_ELEMENTDECODER_H

#include "pegasus/common/NameCache.h"
#include "pegasus/common/XmlReader.h"

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMObject.h>
#include <Pegasus/Common/CIMParamValue.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

namespace Pegasus::wire {

/// CIM-XML elements (DSP0201) to objects. One decoder serves a whole message, or many: it remembers the names it has
/// seen, so that equal names share one text.
///
/// Each function takes the element that its comment names and checks everything in it.
/// Throws: XmlError, with the place. Thread: one thread at a time.
class ElementDecoder
{
  public:
    explicit ElementDecoder(const XmlLimits& limits = XmlLimits()) : fLimits(limits) {}

    /// CLASS. The class's path is its name.
    CIMClass decodeClass(const XmlElement& element);
    /// INSTANCE. The instance's path is its class name.
    CIMInstance decodeInstance(const XmlElement& element);
    /// VALUE.NAMEDINSTANCE: INSTANCENAME and INSTANCE.
    CIMInstance decodeNamedInstance(const XmlElement& element);
    /// QUALIFIER.DECLARATION
    CIMQualifierDecl decodeQualifierDeclaration(const XmlElement& element);

    /// CLASSNAME
    CIMName decodeClassName(const XmlElement& element);
    /// INSTANCENAME
    CIMObjectPath decodeInstanceName(const XmlElement& element);
    /// INSTANCEPATH, LOCALINSTANCEPATH, INSTANCENAME, CLASSPATH, LOCALCLASSPATH or CLASSNAME
    CIMObjectPath decodeObjectPath(const XmlElement& element);
    /// VALUE.REFERENCE
    CIMObjectPath decodeReference(const XmlElement& element);
    /// LOCALNAMESPACEPATH
    CIMNamespaceName decodeLocalNamespacePath(const XmlElement& element);

    /// PARAMVALUE. Without a PARAMTYPE the value is a string and the result is not typed.
    CIMParamValue decodeParamValue(const XmlElement& element);
    /// RETURNVALUE
    CIMValue decodeReturnValue(const XmlElement& element);
    /// VALUE, VALUE.ARRAY, VALUE.REFERENCE or VALUE.REFARRAY, read as `type`.
    CIMValue decodeValue(const XmlElement& element, CIMType type);

    const XmlLimits& limits() const { return fLimits; }
    NameCache& names() { return fNames; }

  private:
    friend class ClassElementDecoder;
    friend class ValueElementDecoder;

    XmlLimits fLimits;
    NameCache fNames;
    std::string fScratch;
    unsigned fEmbeddingDepth = 0;
};

} // namespace Pegasus::wire

#endif
