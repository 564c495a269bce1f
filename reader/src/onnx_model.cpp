#include "onnx_model.h"

#include <filesystem>
#include <fstream>
#include <stdexcept>

#include <onnxruntime_cxx_api.h>
#include <onnxruntime_session_options_config_keys.h>

#include "float_mode.h"
#include "textreader/text_reader.h"

namespace textreader {
namespace {

// One runtime environment for the process: the runtime keeps its thread
// pools and logging there. Never destroyed, so that no reader outlives it.
Ort::Env& SharedEnvironment() {
  static Ort::Env* env = new Ort::Env(ORT_LOGGING_LEVEL_ERROR, "textreader");
  return *env;
}

void CheckReadable(const std::string& path) {
  std::error_code error;
  if (!std::filesystem::is_regular_file(path, error))
    throw ModelError("model file missing: " + path);
  if (!std::ifstream(path, std::ios::binary))
    throw ModelError("model file unreadable: " + path);
}

}  // namespace

struct OnnxModel::Session {
  Ort::Session session{nullptr};
  std::string input_name;
  std::string output_name;
};

OnnxModel::OnnxModel(const std::string& path, int input_rank, int threads)
    : path_(path), session_(std::make_unique<Session>()) {
  CheckReadable(path);
  // The runtime sets its denormal handling on the thread that makes the
  // session too: that thread is the caller's and keeps its own.
  const KeepFloatMode keep_callers_mode;
  try {
    Ort::SessionOptions options;
    options.SetIntraOpNumThreads(threads);
    options.SetInterOpNumThreads(1);
    options.SetGraphOptimizationLevel(GraphOptimizationLevel::ORT_ENABLE_ALL);
    // For the runtime's own threads; Run sees to the calling thread.
    options.AddConfigEntry(kOrtSessionOptionsConfigSetDenormalAsZero, "1");
    session_->session = Ort::Session(SharedEnvironment(), path.c_str(), options);
  } catch (const Ort::Exception& e) {
    throw ModelError("model file does not load: " + path + ": " + e.what());
  }
  Ort::Session& session = session_->session;
  if (session.GetInputCount() != 1 || session.GetOutputCount() < 1)
    throw ModelError("not a model of the expected kind (inputs/outputs): " + path);
  const auto input_shape = session.GetInputTypeInfo(0).GetTensorTypeAndShapeInfo().GetShape();
  if (static_cast<int>(input_shape.size()) != input_rank)
    throw ModelError("not a model of the expected kind (input rank): " + path);
  Ort::AllocatorWithDefaultOptions allocator;
  session_->input_name = session.GetInputNameAllocated(0, allocator).get();
  session_->output_name = session.GetOutputNameAllocated(0, allocator).get();
}

OnnxModel::~OnnxModel() = default;

Tensor OnnxModel::Run(const Tensor& input) const {
  const FlushDenormals flush;  // the calling thread does part of the work
  try {
    const Ort::MemoryInfo memory = Ort::MemoryInfo::CreateCpu(OrtArenaAllocator, OrtMemTypeDefault);
    // The runtime only reads the input; its C API takes a mutable pointer.
    Ort::Value value = Ort::Value::CreateTensor<float>(
        memory, const_cast<float*>(input.values.data()), input.values.size(), input.shape.data(),
        input.shape.size());
    const char* input_name = session_->input_name.c_str();
    const char* output_name = session_->output_name.c_str();
    std::vector<Ort::Value> outputs =
        session_->session.Run(Ort::RunOptions{nullptr}, &input_name, &value, 1, &output_name, 1);
    const Ort::TensorTypeAndShapeInfo info = outputs[0].GetTensorTypeAndShapeInfo();
    Tensor result;
    result.shape = info.GetShape();
    const float* data = outputs[0].GetTensorData<float>();
    result.values.assign(data, data + info.GetElementCount());
    return result;
  } catch (const Ort::Exception& e) {
    throw std::runtime_error("text reader: running " + path_ + " failed: " + e.what());
  }
}

}  // namespace textreader
