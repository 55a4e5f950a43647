#ifndef QV_CORBEL_EXPERTSESSION_H
#define QV_CORBEL_EXPERTSESSION_H

#include <qv1588/corbel.h>

#include <string>

namespace corbel {

// The expert library loaded (SharedLibrary) and one expert object made by its export, for the
// lifetime of one command. The destructor shuts the expert down when it was initialised,
// gives back its reference and unloads the library, in that order.
class ExpertSession {
  public:
    // `libraryPath` empty: the library installed beside this program, else (for the program
    // in the build tree) the one built beside it.
    explicit ExpertSession(const std::string& libraryPath);
    ~ExpertSession();
    ExpertSession(const ExpertSession&) = delete;
    ExpertSession& operator=(const ExpertSession&) = delete;

    // Whether the library was loaded and the expert created; otherwise failure() says why.
    bool isReady() const { return expert_ != nullptr; }
    const std::string& failure() const { return failure_; }

    // Opens the expert's network side; the identity operations work without it.
    bool initialize();

    IkxSysExpert2& expert() const { return *expert_; }
    // The library that was loaded.
    const std::string& libraryPath() const { return path_; }

    // Where the default library is looked for, in order.
    static std::string defaultLibraryPaths();

  private:
    void load(const std::string& path);

    std::string path_;
    void* library_ = nullptr;
    IkxSysExpert2* expert_ = nullptr;
    bool initialized_ = false;
    std::string failure_;
};

}  // namespace corbel

#endif
