// ZVCfgLibAE: the extension class "com.orvex.ZVCfgLib", through which a movie keeps its settings.
//
// A host registers it with IStagecraft::RegisterExtensionClass<ZVCfgLibAE>() and does nothing else with it: the script
// owns the instances, the runtime constructs, calls and destructs them.
//
// Threads. Everything here runs on the runtime's main thread; every method is done when it returns. They block on the
// disk; those that write also on other writers of the folder, at most for 5 s.
//
// Methods. Codes are ReturnCode or a ZV_WS_Status of the library's setting calls (ZVWSLib.h). Arguments must be there
// and of their kind: no text for a number, no number for a boolean. Further arguments are passed over.
//
//     init()                       0. Not needed before the others.
//     setFile(path)                0. The settings file of this instance from then on; it need not exist.
//     read(key, protected)         The text; null when it cannot be had, whatever the reason.
//     write(key, value, protected) The code of ZV_WS_writeSetting.
//     selectEnv(envNum)            The code of ZV_WS_createEnvXML for the file "env.xml" in the settings file's folder.
//     clearEnv()                   The code of ZV_WS_deleteEnvXML for that file.
//
// The environment file is a settings file itself: after setFile(folder + "env.xml") its number is read("EnvNum",
// false).
#pragma once

#include "stagecraft/ASExtensionClass.h"

class ZVCfgLibAE : public ae::stagecraft::ASExtensionClass {
public:
    enum ReturnCode : int {
        kDone = 0,
        kNoFile = -1,          ///< "setFile" has not been called; "read" returns null then.
        kWrongArguments = -3,  ///< An argument is missing or of the wrong kind, or a text holds a NUL character.
    };

    // What the runtime asks of a class (stagecraft/ASExtensionClass.h).
    static const char* GetClassName();
    static bool FiresEvents();
    static void GetMethods(AEArray<ae::stagecraft::ASExtensionClass::Method>& methodArrayToFill);
    static ae::stagecraft::ASExtensionClass* ConstructInstance(ae::stagecraft::StageWindow* window,
                                                               ae::stagecraft::ASObject& object,
                                                               ae::stagecraft::ASValueArray& arguments);
    static void DestructInstance(ae::stagecraft::StageWindow* window, ae::stagecraft::ASObject& object);

    ZVCfgLibAE() = default;
    ~ZVCfgLibAE() override;
    ZVCfgLibAE(const ZVCfgLibAE&) = delete;
    ZVCfgLibAE& operator=(const ZVCfgLibAE&) = delete;

    /// Never called: no method asks for updates.
    void OnUpdate(ae::stagecraft::StageWindow* window, ae::stagecraft::ASObject& object) override;

private:
#define ZVCFGLIBAE_METHODS(M) M(init) M(setFile) M(read) M(write) M(selectEnv) M(clearEnv)
#define ZVCFGLIBAE_DECLARE(name)                                                     \
    void name(ae::stagecraft::StageWindow* window, ae::stagecraft::ASObject& object, \
              ae::stagecraft::ASValueArray& arguments, ae::stagecraft::ASValue& returnValue);
    ZVCFGLIBAE_METHODS(ZVCFGLIBAE_DECLARE)
#undef ZVCFGLIBAE_DECLARE

    AEString m_File;  // what "setFile" was given; empty before
};
