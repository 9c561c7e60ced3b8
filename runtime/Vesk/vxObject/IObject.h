// The runtime that translated text is compiled against: import this file. It declares the two interfaces that
// everything else builds on, and imports the library.

@import "Vesk/vxObject/Registry.h"

namespace vesk
{

$struct AnyInterface;
$struct ReflectedInterface;
$struct ReflectedClass;
$struct IObjectVisitor;
$struct IPrefVisitor;
$struct Archive;
$struct InputArchive;

// What every object offers. The base of a class that is one (IObjectBaseMixin) and generated text supply all of it.
$interface+ IObject
{
    AnyInterface QueryInterface(const ReflectedInterface& interface);
    ReflectedClass const* GetReflectedClass() const;
    void VisitObjects(IObjectVisitor& v) const;
    void VisitPrefs(IPrefVisitor& v) const;
    void EvictDgsNodes() const;
    void DestroyObject();
};

// An object that archives can hold and restore. Without a model it writes nothing, unless it says otherwise.
$interface+ IPersistable : IObject
{
    void Serialise(Archive& ar) const;
    void Deserialise(InputArchive& ar);
};

}

@import "Vesk/vxObject/Caches.h"
@import "Vesk/vxObject/Enums.h"
@import "Vesk/vxObject/OpenVariant.h"
@import "Vesk/vxObject/Remote.h"
