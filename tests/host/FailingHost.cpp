// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/host/FailingHost.h"

#include "velmark/Attributes.h"
#include "velmark/Automation.h"
#include "velmark/Editing.h"
#include "velmark/Events.h"
#include "velmark/Implements.h"
#include "velmark/Media.h"
#include "velmark/Module.h"
#include "velmark/Project.h"
#include "velmark/ProjectNode.h"
#include "velmark/Tracks.h"
#include "velmark/Transport.h"
#include "velmark/UserInterface.h"

#include <algorithm>
#include <string_view>

namespace cadrel::host::tests {

using namespace Velmark;

namespace {

/// Stands for an object of the host behind.
class Wrapper {
public:
    Wrapper(FailingHost& host, FUnknown* real) : m_host(host), m_real(Counted<FUnknown>::share(real)) {}
    virtual ~Wrapper() = default;

    FUnknown* real() const { return m_real.get(); }

protected:
    /// The real object, as long as this lives.
    template <class T>
    T& as() const
    {
        return *dynamic_cast<T*>(m_real.get());
    }
    template <class Call>
    int32 orRefusal(Call call)
    {
        return m_host.fails() ? FailingHost::Refusal : call();
    }
    /// For what is borrowed.
    template <class T, class Call>
    T* orNull(Call call)
    {
        return m_host.fails() ? nullptr : borrowed<T>(call);
    }
    /// For what is counted.
    template <class T, class Call>
    T* countedOrNull(Call call)
    {
        return m_host.fails() ? nullptr : counted<T>(call);
    }
    // The same where a refusal and null are answers, too.
    template <class Call>
    int32 orNone(Call call)
    {
        return m_host.failsToTell() ? FailingHost::Refusal : call();
    }
    template <class T, class Call>
    T* orNothing(Call call)
    {
        return m_host.failsToTell() ? nullptr : borrowed<T>(call);
    }
    template <class T, class Call>
    T* countedOrNothing(Call call)
    {
        return m_host.failsToTell() ? nullptr : counted<T>(call);
    }
    template <class T>
    static T* unwrapped(T* object)
    {
        return dynamic_cast<T*>(FailingHost::unwrap(object));
    }

    FailingHost& m_host;

private:
    template <class T, class Call>
    T* borrowed(Call call)
    {
        return dynamic_cast<T*>(m_host.wrap(call()));
    }
    template <class T, class Call>
    T* counted(Call call)
    {
        const auto given = Counted<T>::adopt(call());
        T* const wrapped = dynamic_cast<T*>(m_host.wrap(given.get()));
        return Counted<T>::share(wrapped).detach();
    }

    Counted<FUnknown> m_real;
};

/// Answers for those of the interfaces that the real object has.
template <class Self, class... Interfaces>
class Failing : public Implements<Self, FObject, Interfaces...>, public Wrapper {
public:
    Failing(FailingHost& host, FUnknown* real) : Wrapper(host, real) {}

    int32 queryInterface(const Identifier& id, void** out) override
    {
        *out = nullptr;
        void* found = nullptr;
        if (m_host.fails() || real()->queryInterface(id, &found) != ResultOk)
            return ResultNoInterface;
        static_cast<FUnknown*>(found)->release();
        return Implements<Self, FObject, Interfaces...>::queryInterface(id, out);
    }
};

class FailingParameter : public Failing<FailingParameter, IParameter> {
public:
    static constexpr const char* ClassName = "FailingParameter";
    using Failing::Failing;

    int32 setValue(int32 flags, double value) override
    {
        return orRefusal([&] { return as<IParameter>().setValue(flags, value); });
    }
    double getValue() override { return as<IParameter>().getValue(); }
};

class FailingLocators : public Failing<FailingLocators, ILocators> {
public:
    static constexpr const char* ClassName = "FailingLocators";
    using Failing::Failing;

    IParameter* getParameter(const char* name) override
    {
        return orNull<IParameter>([&] { return as<ILocators>().getParameter(name); });
    }
};

class FailingTransport : public Failing<FailingTransport, ITransportControl> {
public:
    static constexpr const char* ClassName = "FailingTransport";
    using Failing::Failing;

    IParameter* getParameter(const char* name) override
    {
        return orNull<IParameter>([&] { return as<ITransportControl>().getParameter(name); });
    }
    double getPosition() override { return as<ITransportControl>().getPosition(); }
    int32 setPosition(double seconds) override
    {
        return orRefusal([&] { return as<ITransportControl>().setPosition(seconds); });
    }
    int32 stop() override
    {
        return orRefusal([&] { return as<ITransportControl>().stop(); });
    }
};

class FailingIterator : public Failing<FailingIterator, INodeIterator> {
public:
    static constexpr const char* ClassName = "FailingIterator";
    using Failing::Failing;

    bool isDone() override { return as<INodeIterator>().isDone(); }
    IProjectNode* next() override
    {
        return orNull<IProjectNode>([&] { return as<INodeIterator>().next(); });
    }
};

class FailingList : public Failing<FailingList, IObjectList> {
public:
    static constexpr const char* ClassName = "FailingList";
    using Failing::Failing;

    int32 add(FUnknown* object, int32 reserved) override
    {
        return orRefusal([&] { return as<IObjectList>().add(unwrapped(object), reserved); });
    }
    int32 count() override { return as<IObjectList>().count(); }
    FUnknown* at(int32 index) override
    {
        return orNull<FUnknown>([&] { return as<IObjectList>().at(index); });
    }
};

/// Every object of a project, and the project.
class FailingNode : public Failing<FailingNode, IProjectDocument, ITimeBase, IProjectNode, ITrackNode, IMarkerTrack,
                                   IEnvelopeTrack, IAutomationPoint, IEventNode, IClipEvent> {
public:
    static constexpr const char* ClassName = "FailingNode";
    using Failing::Failing;

    // IProjectDocument
    int32 setProjectEnd(double seconds) override
    {
        return orRefusal([&] { return as<IProjectDocument>().setProjectEnd(seconds); });
    }
    IFilePath* getProjectFile(IProjectDocument* project) override
    {
        return countedOrNull<IFilePath>([&] { return as<IProjectDocument>().getProjectFile(unwrapped(project)); });
    }
    IMarkerTrack* getDefaultMarkerTrack() override
    {
        return orNothing<IMarkerTrack>([&] { return as<IProjectDocument>().getDefaultMarkerTrack(); });
    }
    ILocators* getLocators() override
    {
        return orNull<ILocators>([&] { return as<IProjectDocument>().getLocators(); });
    }
    FUnknown* getContainer(FUnknown* object) override
    {
        return countedOrNull<FUnknown>([&] { return as<IProjectDocument>().getContainer(unwrapped(object)); });
    }
    FUnknown* createTrack(const char* word) override
    {
        return countedOrNull<FUnknown>([&] { return as<IProjectDocument>().createTrack(word); });
    }
    int32 addStorageNotification(IProjectStorageNotification* listener) override
    {
        return orRefusal([&] { return as<IProjectDocument>().addStorageNotification(listener); });
    }
    int32 removeStorageNotification(IProjectStorageNotification* listener) override
    {
        return orRefusal([&] { return as<IProjectDocument>().removeStorageNotification(listener); });
    }
    IMediaPool* getMediaPool() override { return as<IProjectDocument>().getMediaPool(); }

    // ITimeBase
    int32 getFrameRate(FrameRateInfo& info) override
    {
        return orRefusal([&] { return as<ITimeBase>().getFrameRate(info); });
    }
    double getTimeOrigin() override { return as<ITimeBase>().getTimeOrigin(); }

    // IProjectNode
    bool isType(const char* word) override { return node().isType(word); }
    uint32 changeFlags() override { return node().changeFlags(); }
    int32 setAttribute(const char* key, const FVariant& value, bool persistent) override
    {
        const auto set = [&] { return node().setAttribute(key, value, persistent); };
        // A point that takes no mark stands where it should and stays, and nobody is told.
        return std::string_view(key) == AttributeKey::HeldValue ? orNone(set) : orRefusal(set);
    }
    int32 getAttribute(const char* key, FVariant& value) override
    {
        return orNone([&] { return node().getAttribute(key, value); });
    }
    int32 hasAttribute(const char* key) override
    {
        return orNone([&] { return node().hasAttribute(key); });
    }
    int32 removeAttribute(const char* key) override
    {
        return orRefusal([&] { return node().removeAttribute(key); });
    }
    const char16_t* getName() override { return node().getName(); }
    int32 setName(FUnknown* container, IString* name, int32 reserved) override
    {
        return orRefusal([&] { return node().setName(unwrapped(container), name, reserved); });
    }
    bool isSelected() override { return node().isSelected(); }
    double getStart(FUnknown* container) override { return node().getStart(unwrapped(container)); }
    int32 setStart(FUnknown* container, int32 reserved, double seconds) override
    {
        return orRefusal([&] { return node().setStart(unwrapped(container), reserved, seconds); });
    }
    int32 setLength(FUnknown* container, FUnknown* transaction, double seconds) override
    {
        return orRefusal([&] { return node().setLength(unwrapped(container), unwrapped(transaction), seconds); });
    }
    double getEnd(FUnknown* container) override { return node().getEnd(unwrapped(container)); }
    int32 setEnd(FUnknown* container, int32 reserved, double seconds) override
    {
        return orRefusal([&] { return node().setEnd(unwrapped(container), reserved, seconds); });
    }
    double getSourceOffset(FUnknown* container) override { return node().getSourceOffset(unwrapped(container)); }
    INodeIterator* newChildIterator() override
    {
        if (m_host.fails())
            return nullptr;
        const auto iterator = Counted<INodeIterator>::adopt(node().newChildIterator());
        return makeCounted<FailingIterator>(m_host, iterator.get()).detach();
    }
    IProjectNode* getParent() override
    {
        return orNothing<IProjectNode>([&] { return node().getParent(); });
    }

    // ITrackNode
    int32 setFlag(const char* name, bool value) override
    {
        return orRefusal([&] { return as<ITrackNode>().setFlag(name, value); });
    }
    int32 getFlag(const char* name) override
    {
        return orNone([&] { return as<ITrackNode>().getFlag(name); });
    }
    IObjectList* getAutomation() override
    {
        return countedOrNothing<IObjectList>([&] { return as<ITrackNode>().getAutomation(); });
    }

    // What lies on tracks.
    int32 curveNumber() override { return as<IEnvelopeTrack>().curveNumber(); }
    float getValue() override { return as<IAutomationPoint>().getValue(); }
    int32 setValue(float value) override
    {
        return orRefusal([&] { return as<IAutomationPoint>().setValue(value); });
    }
    IEventNode* getOwner() override
    {
        return orNothing<IEventNode>([&] { return as<IEventNode>().getOwner(); });
    }
    IMediaClip* getClip() override
    {
        return orNothing<IMediaClip>([&] { return as<IClipEvent>().getClip(); });
    }
    int32 setClip(IMediaClip* clip, int32 flags) override
    {
        return orRefusal([&] { return as<IClipEvent>().setClip(clip, flags); });
    }

private:
    IProjectNode& node() const { return as<IProjectNode>(); }
};

class FailingEdits : public Failing<FailingEdits, IEditService, IEditTransaction> {
public:
    static constexpr const char* ClassName = "FailingEdits";
    using Failing::Failing;

    int32 copyRange(IProjectDocument* project, IObjectList* tracks, int32 reserved, double start, double end,
                    double destination) override
    {
        return orRefusal([&] {
            return as<IEditService>().copyRange(unwrapped(project), unwrapped(tracks), reserved, start, end,
                                                destination);
        });
    }
    int32 closeRange(IProjectDocument* project, IObjectList* tracks, double start, double end, double reserved) override
    {
        return orRefusal(
            [&] { return as<IEditService>().closeRange(unwrapped(project), unwrapped(tracks), start, end, reserved); });
    }
    int32 begin(bool flag) override
    {
        return orRefusal([&] { return transaction().begin(flag); });
    }
    int32 commit(IProjectDocument* project, const char16_t* name) override
    {
        return orRefusal([&] { return transaction().commit(unwrapped(project), name); });
    }
    int32 insert(FUnknown* parent, FUnknown* child) override
    {
        return orRefusal([&] { return transaction().insert(unwrapped(parent), unwrapped(child)); });
    }
    int32 remove(FUnknown* parent, FUnknown* child) override
    {
        return orRefusal([&] { return transaction().remove(unwrapped(parent), unwrapped(child)); });
    }
    int32 move(FUnknown* parent, FUnknown* newParent, FUnknown* child) override
    {
        return orRefusal([&] { return transaction().move(unwrapped(parent), unwrapped(newParent), unwrapped(child)); });
    }
    int32 copyAll(IProjectDocument* project, FUnknown** clipboard, double start, double end, int32 reserved) override
    {
        return orRefusal([&] { return transaction().copyAll(unwrapped(project), clipboard, start, end, reserved); });
    }
    int32 paste(IProjectDocument* project, FUnknown* clipboard, int32 reserved, double destination) override
    {
        return orRefusal([&] { return transaction().paste(unwrapped(project), clipboard, reserved, destination); });
    }
    int32 deleteRange(IProjectDocument* project, int32 reserved, double start, double end) override
    {
        return orRefusal([&] { return transaction().deleteRange(unwrapped(project), reserved, start, end); });
    }
    int32 addStep(IEditStep* step) override
    {
        return orRefusal([&] { return transaction().addStep(step); });
    }

private:
    IEditTransaction& transaction() const { return as<IEditTransaction>(); }
};

class FailingProjects : public Failing<FailingProjects, IProjectManager> {
public:
    static constexpr const char* ClassName = "FailingProjects";
    using Failing::Failing;

    int32 projectCount() override { return as<IProjectManager>().projectCount(); }
    IProjectDocument* projectAt(int32 index) override
    {
        return orNull<IProjectDocument>([&] { return as<IProjectManager>().projectAt(index); });
    }
    IProjectDocument* activeProject() override
    {
        return orNull<IProjectDocument>([&] { return as<IProjectManager>().activeProject(); });
    }
    int32 addNotification(IProjectNotification*) override { return ResultOk; }
    int32 removeNotification(IProjectNotification*) override { return ResultOk; }
};

class FailingDependencies : public Failing<FailingDependencies, IDependencyManager> {
public:
    static constexpr const char* ClassName = "FailingDependencies";
    using Failing::Failing;

    int32 addDependent(FUnknown* object, FObject* dependent) override
    {
        return orRefusal([&] { return m_host.addDependent(unwrapped(object), dependent); });
    }
    int32 removeDependent(FUnknown* object, FObject* dependent) override
    {
        return orRefusal([&] { return m_host.removeDependent(unwrapped(object), dependent); });
    }
};

class FailingIdle : public Failing<FailingIdle, IIdleManager> {
public:
    static constexpr const char* ClassName = "FailingIdle";
    using Failing::Failing;

    int32 addIdleHandler(IIdleHandler* handler) override
    {
        return orRefusal([&] { return as<IIdleManager>().addIdleHandler(handler); });
    }
    int32 removeIdleHandler(IIdleHandler* handler) override
    {
        return orRefusal([&] { return as<IIdleManager>().removeIdleHandler(handler); });
    }
    int32 setIdleBlocked(bool blocked) override
    {
        return orRefusal([&] { return as<IIdleManager>().setIdleBlocked(blocked); });
    }
};

class FailingProgress : public Failing<FailingProgress, IProgressService> {
public:
    static constexpr const char* ClassName = "FailingProgress";
    using Failing::Failing;

    int32 begin(int32 mode, const char16_t* title, bool* cancelled) override
    {
        return orRefusal([&] { return service().begin(mode, title, cancelled); });
    }
    int32 setStatus(const char16_t* text) override
    {
        return orRefusal([&] { return service().setStatus(text); });
    }
    int32 setRange(uint64 total) override
    {
        return orRefusal([&] { return service().setRange(total); });
    }
    int32 setPosition(uint64 value) override
    {
        return orRefusal([&] { return service().setPosition(value); });
    }
    int32 setText(const char16_t* text) override
    {
        return orRefusal([&] { return service().setText(text); });
    }
    int32 tick(uint64 steps) override
    {
        return orRefusal([&] { return service().tick(steps); });
    }
    int32 show() override
    {
        return orRefusal([&] { return service().show(); });
    }
    int32 end() override
    {
        return orRefusal([&] { return service().end(); });
    }

private:
    IProgressService& service() const { return as<IProgressService>(); }
};

class FailingTranslations : public Failing<FailingTranslations, ITranslationService> {
public:
    static constexpr const char* ClassName = "FailingTranslations";
    using Failing::Failing;

    int32 addTable(BundleHandle bundle, const char* file, const char* domain) override
    {
        return orRefusal([&] { return as<ITranslationService>().addTable(bundle, file, domain); });
    }
    const char16_t* translate(const char16_t* text) override
    {
        return m_host.fails() ? nullptr : as<ITranslationService>().translate(text);
    }
};

class FailingActions : public Failing<FailingActions, IActionManager> {
public:
    static constexpr const char* ClassName = "FailingActions";
    using Failing::Failing;

    int32 addHandler(IActionHandler* handler) override
    {
        return orRefusal([&] { return as<IActionManager>().addHandler(handler); });
    }
    int32 removeHandler(IActionHandler* handler) override
    {
        return orRefusal([&] { return as<IActionManager>().removeHandler(handler); });
    }
    int32 invoke(const char* category, const char* action, int32 reserved) override
    {
        return orRefusal([&] { return as<IActionManager>().invoke(category, action, reserved); });
    }
};

class FailingContext : public Failing<FailingContext, IHostContext> {
public:
    static constexpr const char* ClassName = "FailingContext";
    using Failing::Failing;

    int32 getInterface(const Identifier& id, void** out) override
    {
        *out = nullptr;
        void* found = nullptr;
        if (m_host.fails() || as<IHostContext>().getInterface(id, &found) != ResultOk)
            return FailingHost::Refusal;
        const auto given = Counted<FUnknown>::adopt(static_cast<FUnknown*>(found));
        FUnknown* const wrapped = m_host.wrap(given.get());
        // Of what is passed on as it is, and for a class, the pointer is the one wanted; a service's is its interface's.
        if (wrapped == given.get() || !answersFor(id, wrapped, out)) {
            wrapped->addRef();
            *out = wrapped;
        }
        return ResultOk;
    }

private:
    template <class... Interfaces>
    static bool answersForOneOf(const Identifier& id, FUnknown* object, void** out)
    {
        const auto give = [&](auto* interface) {
            if (!interface)
                return false;
            interface->addRef();
            *out = interface;
            return true;
        };
        return ((id == Interfaces::iid && give(dynamic_cast<Interfaces*>(object))) || ...);
    }
    /// Without a call to the object, which counts.
    static bool answersFor(const Identifier& id, FUnknown* object, void** out)
    {
        return answersForOneOf<IEditService, IProjectManager, IDependencyManager, IIdleManager, IProgressService,
                               ITranslationService, IActionManager, ITransportControl, IObjectList, IClipEvent>(
            id, object, out);
    }
};

/// Passes on what the host tells of its objects.
class FailingDependent : public Implements<FailingDependent, FObject> {
public:
    static constexpr const char* ClassName = "FailingDependent";

    FailingDependent(FailingHost& host, FObject* dependent) : m_host(host), m_dependent(dependent) {}

    int32 update(FUnknown* changed, int32 message) override
    {
        return m_dependent->update(m_host.wrap(changed), message);
    }

private:
    FailingHost& m_host;
    FObject* m_dependent;
};

/// The object that stands for a real one; null for what is passed on as it is.
template <class Interface, class Wrapping, class... Rest>
Counted<FObject> wrapperOf(FailingHost& host, FUnknown* real)
{
    if (dynamic_cast<Interface*>(real))
        return makeCounted<Wrapping>(host, real);
    if constexpr (sizeof...(Rest) > 0)
        return wrapperOf<Rest...>(host, real);
    else
        return nullptr;
}

} // namespace

FailingHost::FailingHost(IHostContext* host) : m_host(host) {}

FailingHost::~FailingHost() = default;

IHostContext* FailingHost::context()
{
    return dynamic_cast<IHostContext*>(wrap(m_host));
}

void FailingHost::arm(std::size_t call)
{
    m_callCount = 0;
    m_failsAt = call;
}

std::size_t FailingHost::heldCount() const
{
    return static_cast<std::size_t>(
        std::ranges::count_if(m_objects, [](const auto& object) { return object.second->refCount() > 1; }));
}

FUnknown* FailingHost::wrap(FUnknown* real)
{
    // Whichever of its interfaces it came as, an object is known by the one.
    const auto key = query<FUnknown>(real);
    const auto found = m_objects.find(key.get());
    if (found != m_objects.end())
        return found->second.get();
    auto wrapper =
        wrapperOf<IProjectNode, FailingNode, IObjectList, FailingList, IParameter, FailingParameter, ILocators,
                  FailingLocators, ITransportControl, FailingTransport, IEditService, FailingEdits, IProjectManager,
                  FailingProjects, IDependencyManager, FailingDependencies, IIdleManager, FailingIdle, IProgressService,
                  FailingProgress, ITranslationService, FailingTranslations, IActionManager, FailingActions,
                  IHostContext, FailingContext>(*this, real);
    // A clip of the media pool is a node as well; those go through as they are.
    if (!wrapper || dynamic_cast<IMediaClip*>(real))
        return real;
    return m_objects.emplace(key.get(), std::move(wrapper)).first->second.get();
}

FUnknown* FailingHost::unwrap(FUnknown* object)
{
    const auto* const wrapper = dynamic_cast<Wrapper*>(object);
    return wrapper ? wrapper->real() : object;
}

int32 FailingHost::addDependent(FUnknown* object, FObject* dependent)
{
    const auto passing = makeCounted<FailingDependent>(*this, dependent);
    m_dependents.emplace(std::pair(object, dependent), passing);
    return service<IDependencyManager>(m_host)->addDependent(object, passing.get());
}

int32 FailingHost::removeDependent(FUnknown* object, FObject* dependent)
{
    const auto found = m_dependents.find({object, dependent});
    if (found == m_dependents.end())
        return Refusal;
    const int32 result = service<IDependencyManager>(m_host)->removeDependent(object, found->second.get());
    m_dependents.erase(found);
    return result;
}

} // namespace cadrel::host::tests
