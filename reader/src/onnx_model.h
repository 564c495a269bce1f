// One ONNX network loaded into an ONNX Runtime session: a float tensor in,
// the first output out.
#ifndef TEXTREADER_ONNX_MODEL_H_
#define TEXTREADER_ONNX_MODEL_H_

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace textreader {

struct Tensor {
  std::vector<std::int64_t> shape;
  std::vector<float> values;
};

class OnnxModel {
 public:
  // Loads `path`; throws ModelError naming it when it is missing, does not
  // load, or does not take one tensor of `input_rank` dimensions. `threads`
  // intra-op threads, 0 for the runtime's default.
  OnnxModel(const std::string& path, int input_rank, int threads);
  ~OnnxModel();
  OnnxModel(const OnnxModel&) = delete;
  OnnxModel& operator=(const OnnxModel&) = delete;

  // Runs the network on `input` (row-major, `input.shape`). A runtime failure
  // becomes a std::runtime_error naming the model.
  Tensor Run(const Tensor& input) const;

  const std::string& path() const { return path_; }

 private:
  struct Session;
  std::string path_;
  std::unique_ptr<Session> session_;
};

}  // namespace textreader

#endif  // TEXTREADER_ONNX_MODEL_H_
