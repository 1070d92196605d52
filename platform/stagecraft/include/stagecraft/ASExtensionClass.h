// Extension classes: how native code appears to a movie.
//
// Threads: the runtime must call handlers, OnUpdate, ConstructInstance and DestructInstance on the main thread only.
// They must return soon: while one of them runs nothing else of the movie does, and a stop request waits.
//
// An extension class is a class derived from ASExtensionClass with these static members, from which
// IStagecraft::RegisterExtensionClass<T>() takes them:
//
//   static const char* GetClassName();                       the dotted script class name
//   static bool FiresEvents();                               whether the class fires events of the runtime
//   static void GetMethods(AEArray<ASExtensionClass::Method>& methodArrayToFill);
//   static ASExtensionClass* ConstructInstance(StageWindow* pWindow, ASObject& object, ASValueArray& arguments);
//   static void DestructInstance(StageWindow* pWindow, ASObject& object);
//
// ConstructInstance answers the script's "new": it returns the native instance that stands behind the object, or null,
// which the script sees as an error. DestructInstance deletes it (object.GetExtensionInstance()). The runtime must call
// it exactly once for every instance: when the script object was collected, or when the stage-window set is destroyed;
// never while a handler or OnUpdate of that instance runs, while native code holds a reference to the object, or while
// the object is registered for updates, except when the set is destroyed.
//
// A static function is still a member function in native code. When the script calls it on the class, the runtime must
// run it on an instance that it constructs for the class, with no arguments, on the first such call.
#pragma once

#include "stagecraft/ASValue.h"

namespace ae {
namespace stagecraft {

// A window of the movie. Owned by the runtime, lives as long as its stage-window set.
class StageWindow {
public:
    // The movie ends: the script code that runs now finishes, nothing of the movie is called after it. Main thread.
    virtual void EndMovie() = 0;

protected:
    virtual ~StageWindow() {}
};

class ASExtensionClass {
public:
    // A handler. returnValue is undefined when the handler is entered. Values in the array may be changed freely.
    typedef void (ASExtensionClass::*Function)(StageWindow* pWindow, ASObject& object, ASValueArray& arguments,
                                               ASValue& returnValue);

    struct Method {
        enum Type {
            kMemberFunction = 0,  // called on the instance; on anything else the script gets an error naming the method
            kStaticFunction = 1,  // needs no instance state: callable on an instance, and on the class itself
        };
        const char* m_pName;  // static storage
        Type m_type;
        Function m_function;
    };

    // A row for the handler of a derived class: MakeMethod("init", Method::kMemberFunction, &ZVExample::init).
    template <class T>
    static Method MakeMethod(const char* pName, Method::Type type,
                             void (T::*function)(StageWindow*, ASObject&, ASValueArray&, ASValue&))
    {
        return Method{pName, type, static_cast<Function>(function)};
    }

    // Called once a tick while the object is registered for updates. Does nothing here.
    virtual void OnUpdate(StageWindow* /*pWindow*/, ASObject& /*object*/) {}
    virtual ~ASExtensionClass() {}
};

}  // namespace stagecraft
}  // namespace ae
