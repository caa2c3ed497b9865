// The protoc plugin that turns the schema into message classes.

#include <exception>
#include <memory>
#include <string>
#include <vector>

#include <google/protobuf/compiler/code_generator.h>
#include <google/protobuf/compiler/plugin.h>
#include <google/protobuf/io/coded_stream.h>
#include <google/protobuf/io/zero_copy_stream.h>

#include "messages/generator/HeaderEmitter.h"
#include "messages/generator/Names.h"
#include "messages/generator/SourceEmitter.h"

namespace quorl::generator {
namespace {

using google::protobuf::FileDescriptor;
using google::protobuf::compiler::GeneratorContext;

class MessageGenerator : public google::protobuf::compiler::CodeGenerator {
 public:
  bool Generate(const FileDescriptor* file, const std::string& parameter, GeneratorContext* context,
                std::string* error) const override {
    return GenerateAll({file}, parameter, context, error);
  }

  bool GenerateAll(const std::vector<const FileDescriptor*>& files, const std::string& /*parameter*/,
                   GeneratorContext* context, std::string* error) const override {
    try {
      for (const FileDescriptor* file : files) {
        write(*context, baseName(*file) + ".h", emitHeader(*file));
        write(*context, baseName(*file) + ".cpp", emitSource(*file));
      }
      write(*context, "registry.cpp", emitRegistry(files));
    } catch (const std::exception& problem) {
      *error = problem.what();
      return false;
    }
    return true;
  }

 private:
  static void write(GeneratorContext& context, const std::string& name, const std::string& text) {
    const std::unique_ptr<google::protobuf::io::ZeroCopyOutputStream> stream(context.Open(name));
    google::protobuf::io::CodedOutputStream output(stream.get());
    output.WriteString(text);
  }
};

}  // namespace
}  // namespace quorl::generator

int main(int argc, char** argv) {
  const quorl::generator::MessageGenerator generator;
  return google::protobuf::compiler::PluginMain(argc, argv, &generator);
}
