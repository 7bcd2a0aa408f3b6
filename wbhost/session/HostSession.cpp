// The host session.
#include "session/HostSession.h"

#include "cli/HostedModule.h"
#include "host/contracts/IwbProjectProvider.h"
#include "project/HexStatus.h"
#include "project/ProviderFactory.h"
#include "runner/EngineHostProgram.h"
#include "runtime/EngineTable.h"
#include "session/ProjectLookups.h"
#include "session/RootObject.h"

#include <new>

namespace wbhost::session {

using qv::com::ComPtr;

namespace {

using GetProviderFn = HRESULT(int32_t, void**);

bool Fail(std::string* error, std::string message) {
    if (error != nullptr)
        *error = std::move(message);
    return false;
}

// The runtime has one resolver for the process; only the session that set it clears it, so
// closing one session does not cut off another's project.
const HostSession* resolverOwner = nullptr;
// The same for the programs run through the engine table: the newest session's program session
// runs them.
const HostSession* engineOwner = nullptr;

} // namespace

HostSession::HostSession()
    : resources_(std::make_unique<resources::ResourceService>()),
      programs_(std::make_shared<runner::ProgramSession>()), link_(std::make_shared<ProjectLink>()),
      runners_(runner::NewRunnerService(programs_)) {
    session::RootObject* root = nullptr;
    session::RootObject::CreateInstance(&root,
                                        ComPtr<IwbProgramRunnerService>::Share(runners_.Get()));
    root_ = ComPtr<IUnknown>::Adopt(root ? root->GetUnknown() : nullptr);
    if (!runners_ || !root_)
        throw std::bad_alloc();
    // Runners keep the finder they were made with; through the link, one made before a project
    // was opened finds its items too, and one kept after it closed finds nothing.
    runners_->SetItemFinder(FinderFor(link_));
    runtime::SetEngineProgramOpener(runner::EngineProgramOpenerFor(programs_));
    engineOwner = this;
}

HostSession::~HostSession() {
    Close();
    if (engineOwner == this) {
        runtime::SetEngineProgramOpener({});
        engineOwner = nullptr;
    }
    // The provider goes before the module whose code it runs.
    provider_.Reset();
    module_.reset();
}

bool HostSession::Open(const std::string& modulePath, std::string* error) {
    if (module_)
        return Fail(error, "a module is loaded already");
    auto module = std::make_unique<cli::HostedModule>(modulePath);
    if (!module->Loaded())
        return Fail(error, module->Error());
    auto* getProvider = module->Find<GetProviderFn>("qxGetProvider");
    if (getProvider == nullptr)
        return Fail(error, "the module \"" + modulePath + "\" has no qxGetProvider");
    void* raw = nullptr;
    if (const HRESULT hr = getProvider(0, &raw); FAILED(hr) || raw == nullptr)
        return Fail(error, "the module gave no provider (status " + HexStatus(hr) + ")");
    auto provider = ComPtr<IqxProvider>::Adopt(static_cast<IqxProvider*>(raw));
    if (const HRESULT hr = provider->Initialize(root_.Get()); FAILED(hr))
        return Fail(error, "the provider refused to start (status " + HexStatus(hr) + ")");
    module_ = std::move(module);
    provider_ = std::move(provider);
    if (!project_)
        return true;
    // A project opened before the module: the provider makes its items from now on.
    project_->SetObjectFactory(project::ProviderFactory(provider_));
    return AttachProvider(false, error);
}

bool HostSession::NewProject(std::u16string name, std::string* error) {
    Close();
    auto project = std::make_unique<project::Project>(*resources_,
                                                      name.empty() ? u"Project" : std::move(name));
    if (provider_)
        project->SetObjectFactory(project::ProviderFactory(provider_));
    return Attach(std::move(project), false, error);
}

bool HostSession::OpenProject(const std::string& path, std::string* error) {
    // The open project stays until the new one has been read: a file that does not open must not
    // cost the work in memory.
    auto project = project::Project::Open(path, *resources_, error,
                                          provider_ ? project::ProviderFactory(provider_)
                                                    : project::Project::ObjectFactory{});
    if (!project)
        return false;
    Close();
    if (!Attach(std::move(project), true, error))
        return false;
    projectPath_ = path;
    return true;
}

bool HostSession::Attach(std::unique_ptr<project::Project> project, bool reloaded,
                         std::string* error) {
    project_ = std::move(project);
    Wire();
    if (AttachProvider(reloaded, error))
        return true;
    Close();
    return false;
}

bool HostSession::AttachProvider(bool reloaded, std::string* error) {
    const auto attachable = provider_.As<IwbProjectProvider>();
    if (!attachable)
        return true;
    if (const HRESULT hr = project_->AttachProvider(attachable, reloaded); FAILED(hr))
        return Fail(error, "the provider refused the project (status " + HexStatus(hr) + ")");
    attachable->ProjectReady();
    return true;
}

bool HostSession::Save(const std::string& path, std::string* error) {
    if (!project_)
        return Fail(error, "no project is open");
    const std::string target = path.empty() ? projectPath_ : path;
    if (target.empty())
        return Fail(error, "the project has no file yet: name one to save it to");
    if (!project_->Save(target, error))
        return false;
    projectPath_ = target;
    return true;
}

void HostSession::Close() {
    if (!project_)
        return;
    project_->DetachProviders();
    Unwire();
    project_.reset();
    projectPath_.clear();
}

void HostSession::Wire() {
    link_->project = project_.get();
    runtime::SetTargetItemResolver(ResolverFor(link_));
    resolverOwner = this;
}

void HostSession::Unwire() {
    // Runners hold the link, not the project: they answer "none" from now on.
    link_->project = nullptr;
    if (resolverOwner == this) {
        runtime::SetTargetItemResolver({});
        resolverOwner = nullptr;
    }
}

} // namespace wbhost::session
