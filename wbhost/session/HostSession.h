// One host process model: the loaded module and its provider, the resource service, the open
// project and the program session, tied together through the framework's root object.
#pragma once

#include "com/ComPtr.h"
#include "framework/IqxProvider.h"
#include "project/Project.h"
#include "resources/ResourceService.h"
#include "runner/ProgramSession.h"
#include "runner/RunnerService.h"

#include <memory>
#include <string>

namespace wbhost::cli {
class HostedModule;
}

namespace wbhost::session {

struct ProjectLink;

// Not thread-safe: like the framework it stands for, a session is driven from one thread.
class HostSession {
public:
    // A session without module or project; its root object and runner service exist already.
    HostSession();
    // Closes the project (detaching the provider), then lets go of the provider and the module.
    ~HostSession();
    HostSession(const HostSession&) = delete;
    HostSession& operator=(const HostSession&) = delete;

    // Loads the module file MODULEPATH, takes its current provider (qxGetProvider) and
    // initialises it with the root object. False with a message in ERROR (may be null) when the
    // module does not load, lacks the entry, refuses, or a module is loaded already.
    bool Open(const std::string& modulePath, std::string* error);
    // Closes the open project and starts an empty one called NAME (empty: "Project"), with the
    // provider (if any) attached. False with a message in ERROR when the provider refuses.
    bool NewProject(std::u16string name, std::string* error);
    // Reads the project file PATH, the provider making its items, and puts it in place of the
    // open project; the provider is attached as to a reloaded project. False with a message in
    // ERROR when the file cannot be read or is refused: the open project is then kept, unless
    // it was the provider's attach that failed (the session is left without project).
    bool OpenProject(const std::string& path, std::string* error);
    // Saves the project to PATH (empty: the file it was opened from or last saved to): the
    // providers hear ProjectSaving before anything is written and ProjectSaved after. False with
    // a message in ERROR when no project is open, no path is known, a provider refuses or the
    // file cannot be written (the previous file is then kept).
    bool Save(const std::string& path, std::string* error);
    // Detaches the provider and closes the project; item lookups of runners and the runtime
    // answer "none" from then on. Nothing happens when no project is open.
    void Close();

    // The open project; null when none.
    project::Project* Project() noexcept { return project_.get(); }
    // The file the project came from or was last saved to; empty for a new, unsaved project.
    const std::string& ProjectPath() const noexcept { return projectPath_; }
    // The loaded module, for its other exports; null before Open.
    const cli::HostedModule* Module() const noexcept { return module_.get(); }
    // The module's provider; null before Open.
    IqxProvider* Provider() const noexcept { return provider_.Get(); }
    // The framework's root object the provider was initialised with (never null).
    IUnknown* RootObject() const noexcept { return root_.Get(); }
    // The answers programs run with and the log of their runs.
    runner::ProgramSession& Programs() noexcept { return *programs_; }
    // The hardware-resource service that loads the targets' trees.
    resources::ResourceService& Resources() noexcept { return *resources_; }

private:
    bool Attach(std::unique_ptr<project::Project> project, bool reloaded, std::string* error);
    // Attaches the provider, if it takes projects, to the open project and tells it the project
    // is ready; false with a message in ERROR when it refuses.
    bool AttachProvider(bool reloaded, std::string* error);
    void Wire();
    void Unwire();

    std::unique_ptr<resources::ResourceService> resources_;
    std::shared_ptr<runner::ProgramSession> programs_;
    std::shared_ptr<ProjectLink> link_;
    qv::com::ComPtr<runner::RunnerService> runners_;
    qv::com::ComPtr<IUnknown> root_;
    std::unique_ptr<cli::HostedModule> module_;
    qv::com::ComPtr<IqxProvider> provider_;
    std::unique_ptr<project::Project> project_;
    std::string projectPath_;
};

} // namespace wbhost::session
