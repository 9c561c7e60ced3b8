@import "check.h"

vxDefineTarget(check, 1)
void Register_Project_check();
void Unregister_Project_check();
void CheckReflection();
void CheckInterfaces();
void CheckKinds();
void CheckBareTypes();
void CheckSignatures();
void CheckArchives();
void CheckSchemas();
void CheckChanges();
void CheckReleases();
void CheckThreads();
void CheckHostileReferences();
void CheckHostileTypes();
void CheckHostileVariants();
void CheckHostileNumbers();
void CheckHostileSizes();
void CheckLimits();
void CheckRemote();
void CheckRemoteErrors();
void CheckRemoteMessages();
void CheckRemoteAnswers();
void CheckRemotePersistable();
void CheckJsonBothWays();
void CheckJsonErrors();
void CheckJsonObjects();
void CheckAccess();
void CheckGraph();
void CheckCaches();
void CheckCachesInTemplates();
void CheckVisiting();
void CheckEvictions();
void CheckWritesInside();
void CheckErrorsInside();
void CheckFields();
void CheckChains();
void CheckManyLinks();
void CheckManyWrites();
void CheckGraphThreads();
void CheckLinkedObjects();
void CheckReadClasses();
void CheckHeap();
void CheckTexts();
void CheckCopies();
void CheckOwnParts();
void CheckProjects();
void CheckForgotten();

// Goes when statics of the library might be gone.
struct Last
{
    ~Last()
    {
        if (!vesk::Find<vesk::ReflectedInterface>("vesk::IObject") && vesk::All<vesk::ReflectedEnum>().empty())
        {
            vesk::xout() << "last\n";
        }
    }
} g_last;

int main()
{
    Register_Project_check();
    for (auto check : {CheckReflection, CheckInterfaces, CheckKinds, CheckBareTypes, CheckSignatures, CheckArchives,
                       CheckSchemas, CheckChanges, CheckReleases, CheckThreads, CheckHostileReferences,
                       CheckHostileTypes, CheckHostileVariants, CheckHostileNumbers, CheckHostileSizes, CheckLimits,
                       CheckRemote, CheckRemoteErrors, CheckRemoteMessages, CheckRemoteAnswers, CheckRemotePersistable,
                       CheckJsonBothWays, CheckJsonErrors, CheckJsonObjects, CheckAccess, CheckGraph, CheckCaches,
                       CheckCachesInTemplates, CheckVisiting, CheckEvictions, CheckWritesInside, CheckErrorsInside,
                       CheckFields, CheckChains, CheckManyLinks, CheckManyWrites, CheckGraphThreads, CheckLinkedObjects,
                       CheckReadClasses, CheckHeap, CheckTexts, CheckCopies,
                       CheckOwnParts, CheckProjects})
    {
        check();
    }
    CheckForgotten();
    Unregister_Project_check();
    CHECK(vesk::Find<vesk::ReflectedClass>("Linked") == nullptr, true);
    std::printf("%d checks, %d failures\n", g_checks, g_failures);
    return g_failures > 0;
}
