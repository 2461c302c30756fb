// A small plug-in for the tool's end-to-end tests, built in two parts:
// part 1 creates "storage sample" with "hello"; part 2 adds "bye" and needs
// part 1 to have been registered before it.
#include <boost/pointer_cast.hpp>
#include <cstdlib>
#include <fstream>

#include "Fendle/AutoCli.h"
#include "HostCtl/Lib.h"

namespace {

// Notes in $HYRACLI_TEST_TRACE that a command object was destroyed, which only
// works while this library is still loaded.
void Trace(const std::string& line) {
  const char* path = std::getenv("HYRACLI_TEST_TRACE");
  if (path != nullptr) std::ofstream(path, std::ios::app) << line << "\n";
}

class Greeting : public Fendle::AutoCli::Command {
 public:
  static boost::shared_ptr<Greeting> New(const std::string& word) {
    return boost::shared_ptr<Greeting>(new Greeting(word));
  }
  ~Greeting() override { Trace(word_ + " destroyed"); }

 protected:
  boost::shared_ptr<Fendle::CallSpec::InputSpec> GetInputSpecInternal() override {
    boost::shared_ptr<Fendle::CallSpec::InputSpec> spec = Fendle::CallSpec::InputSpec::New();
    boost::shared_ptr<Fendle::CallSpec::ParameterSpec> name =
        Fendle::CallSpec::ParameterSpec::New("name", Fendle::CallSpec::ParameterType::String);
    name->SetAlias("n");
    name->SetHelp("Who to greet");
    name->SetRequired(false);
    spec->AddParameter(name);
    return spec;
  }
  void ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) override {
    std::string text = word_;
    if (input->IsSet("name")) text += ", " + input->GetString("name");
    output->SetResult(Fendle::MetaObj::MetaString::New(text));
    output->Finish();
  }

 private:
  explicit Greeting(const std::string& word) : word_(word) {
    SetDescription("Say " + word_ + ".");
    SetDefaultOutputFormatter("simple");
  }
  std::string word_;
};

boost::shared_ptr<Fendle::AutoCli::Namespace> Child(
    const boost::shared_ptr<Fendle::AutoCli::Namespace>& parent, const std::string& name) {
  boost::shared_ptr<Fendle::AutoCli::Namespace> child =
      boost::dynamic_pointer_cast<Fendle::AutoCli::Namespace>(parent->GetNamespaceNode(name));
  if (!child) {
    throw HostCtl::Lib::HostCtlException("no namespace '" + name + "'",
                                         HostCtl::Lib::KelmMessage());
  }
  return child;
}

}  // namespace

extern "C" void AutoCli_RegisterNamespaces(boost::shared_ptr<Fendle::AutoCli::Namespace>& root) {
  boost::shared_ptr<Fendle::AutoCli::Namespace> storage = Child(root, "storage");
#if SAMPLE_PART == 1
  boost::shared_ptr<Fendle::AutoCli::Namespace> sample = Fendle::AutoCli::Namespace::New();
  sample->SetDescription("Sample commands.");
  sample->RegisterNamespaceNode(Greeting::New("Hello"), "hello");
  storage->RegisterNamespaceNode(sample, "sample");
#else
  Child(storage, "sample")->RegisterNamespaceNode(Greeting::New("Bye"), "bye");
#endif
}
