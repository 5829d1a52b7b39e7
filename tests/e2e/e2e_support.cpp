// Module copies, alert logs and synthetic documents for the end-to-end tests.
#include "e2e_support.h"

#include <atomic>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>

namespace E2E {

namespace {

void SetVariable(const char* name, const std::string& value) {
#ifdef _WIN32
  _putenv_s(name, value.c_str());
#else
  setenv(name, value.c_str(), 1);
#endif
}

std::string Portable(std::string path) {
#ifdef _WIN32
  // Wine sees the Unix root as drive Z:.
  if (!path.empty() && path[0] == '/') path = "Z:" + path;
#endif
  return path;
}

}  // namespace

std::string ModulePath() {
  if (const char* path = std::getenv("FRINGE_MODULE"); path != nullptr && *path != '\0') {
    return path;
  }
  return Portable(FRINGE_MODULE_PATH);
}

Standin::Document PageDocument(const Synth::PageRecipe& recipe) {
  Synth::Page page = Synth::GeneratePage(recipe);
  Standin::Document document(page.width, page.height, recipe.color ? 3 : 1, recipe.alpha);
  std::ptrdiff_t rowBytes = static_cast<std::ptrdiff_t>(page.width) * page.channels;
  document.SetPixels(std::move(page.pixels), rowBytes);
  return document;
}

Synth::PageRecipe PhotoPage(int width, int height, double angle, uint32_t seed) {
  Synth::PageRecipe recipe;
  recipe.width = width;
  recipe.height = height;
  recipe.photo = Synth::PhotoRecipe{width * 0.5, height * 0.5, width * 0.55, height * 0.5, angle};
  recipe.seed = seed;
  return recipe;
}

Synth::PageRecipe BlankPage(int width, int height, uint32_t seed) {
  Synth::PageRecipe recipe;
  recipe.width = width;
  recipe.height = height;
  recipe.seed = seed;
  return recipe;
}

std::vector<std::array<int16_t, 9>> RecordValues(const Standin::Host& host) {
  std::vector<std::array<int16_t, 9>> values;
  for (const auto& bytes : host.Records(kRecordType)) {
    std::array<int16_t, 9> record{};
    if (bytes.size() == sizeof record) std::memcpy(record.data(), bytes.data(), sizeof record);
    values.push_back(bytes.size() == sizeof record ? record : std::array<int16_t, 9>{-1});
  }
  return values;
}

std::array<int16_t, 9> FailureRecord(int16_t rows, int16_t columns) {
  auto r = static_cast<int16_t>(rows - 1);
  auto c = static_cast<int16_t>(columns - 1);
  return {0, 0, 0, c, r, c, r, 0, 0};
}

ModuleTest::ModuleTest() {
  static std::atomic<int> counter{0};
  const auto* info = ::testing::UnitTest::GetInstance()->current_test_info();
  std::string name =
      info != nullptr ? std::string(info->test_suite_name()) + "." + info->name() : "test";
  for (char& c : name) {
    if (c == '/') c = '_';
  }
  alertLog_ = (std::filesystem::temp_directory_path() /
               ("fringe-alerts-" + name + "-" + std::to_string(counter++) + ".log"))
                  .string();
  std::filesystem::remove(alertLog_);
  SetVariable("FRINGE_ALERT_LOG", alertLog_);
  module_ = Standin::Module::Load(ModulePath(), true);
}

ModuleTest::~ModuleTest() {
  std::error_code ignored;
  std::filesystem::remove(alertLog_, ignored);
}

void ModuleTest::TearDown() {
  std::vector<std::string> alerts = TakeAlerts();
  std::string text;
  for (const std::string& line : alerts) text += line + "\n";
  EXPECT_TRUE(alerts.empty()) << "alerts nobody expected:\n" << text;
}

std::unique_ptr<Standin::Host> ModuleTest::MakeHost(Standin::Document document) {
  return std::make_unique<Standin::Host>(*module_, std::move(document));
}

std::vector<std::string> ModuleTest::TakeAlerts() {
  std::vector<std::string> lines;
  std::ifstream in(alertLog_, std::ios::binary);
  for (std::string line; std::getline(in, line);) {
    if (!line.empty() && line.back() == '\r') line.pop_back();
    lines.push_back(line);
  }
  in.close();
  std::error_code ignored;
  std::filesystem::remove(alertLog_, ignored);
  return lines;
}

void ModuleTest::ExpectClean(const Standin::Host& host) {
  EXPECT_TRUE(host.Problems().Empty()) << host.Problems().Text();
}

}  // namespace E2E
