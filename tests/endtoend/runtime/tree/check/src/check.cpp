@import "check.h"

vxDefineTarget(check, 1)
void Register_Project_check();
void Unregister_Project_check();
void CheckReflection();
void CheckInterfaces();
void CheckKinds();
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
void CheckJsonBothWays();
void CheckJsonErrors();
void CheckJsonObjects();
void CheckAccess();
void CheckGraph();
void CheckCaches();
void CheckVisiting();

int main()
{
    Register_Project_check();
    for (auto check : {CheckReflection, CheckInterfaces, CheckKinds, CheckArchives, CheckSchemas, CheckChanges,
                       CheckReleases, CheckThreads, CheckHostileReferences, CheckHostileTypes, CheckHostileVariants,
                       CheckHostileNumbers, CheckHostileSizes, CheckLimits, CheckRemote, CheckRemoteErrors,
                       CheckRemoteMessages, CheckRemoteAnswers, CheckJsonBothWays, CheckJsonErrors, CheckJsonObjects,
                       CheckAccess, CheckGraph, CheckCaches, CheckVisiting})
    {
        check();
    }
    Unregister_Project_check();
    std::printf("%d checks, %d failures\n", g_checks, g_failures);
    return g_failures > 0;
}
